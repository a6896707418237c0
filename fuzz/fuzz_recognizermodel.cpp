// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The files of a pocketsphinx model as the quick check reads them before a language counts as
// installed: any bytes may sit in a bundle somebody copied into a recognizer folder. The first byte
// of the input chooses the file, the rest is its content; the other files are small and intact.
#include "PocketsphinxModelCheck.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>

using Cadenza::Engines::PocketsphinxModelFiles;
using Cadenza::Platform::RecognizerModel;

namespace {

const char *const Files[] = {"acoustic/mdef", "acoustic/means", "acoustic/variances",
    "acoustic/transition_matrices", "acoustic/sendump", "acoustic/mixture_weights", "acoustic/feat.params",
    "acoustic/noisedict", "language.lm.bin", "pronunciation.dict"};

QByteArray table(std::initializer_list<quint32> counts, quint32 floats)
{
    QByteArray bytes("s3\nversion 1.0\nchksum0 yes\nendhdr\n");
    const auto word = [&bytes](quint32 value) { bytes.append(reinterpret_cast<const char *>(&value), 4); };
    word(0x11223344);
    for (const quint32 count : counts) {
        word(count);
    }
    word(floats);
    for (quint32 i = 0; i <= floats; ++i) {
        word(0); // the floats, then the checksum
    }
    return bytes;
}

void write(const QString &path, const QByteArray &content)
{
    QFile file(path);
    if (file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
        file.write(content);
    }
}

struct Bundle
{
    QTemporaryDir folder;
    RecognizerModel model;

    Bundle()
    {
        QDir().mkpath(folder.filePath(QStringLiteral("Resources/acoustic")));
        model.bundlePath = folder.path();
        model.engineName = QStringLiteral("pocketsphinx");
        model.files = {{QStringLiteral("AcousticModel"), QStringLiteral("Resources/acoustic")},
            {QStringLiteral("LanguageModel"), QStringLiteral("Resources/language.lm.bin")},
            {QStringLiteral("Dictionary"), QStringLiteral("Resources/pronunciation.dict")}};
    }
    QString path(const char *file) const
    {
        return folder.filePath(QStringLiteral("Resources/") + QLatin1String(file));
    }
    void reset()
    {
        write(path("acoustic/mdef"), "0.3\n0 n_base\n");
        write(path("acoustic/means"), table({1, 1, 1, 1}, 1));
        write(path("acoustic/variances"), table({1, 1, 1, 1}, 1));
        write(path("acoustic/transition_matrices"), table({1, 1, 2}, 2));
        write(path("acoustic/mixture_weights"), table({1, 1, 1}, 1));
        QFile::remove(path("acoustic/sendump"));
        write(path("acoustic/feat.params"), "-feat 1s_c_d_dd\n");
        write(path("acoustic/noisedict"), "<s> SIL\n");
        write(path("language.lm.bin"), "\\data\\\nngram 1=0\n\\end\\\n");
        write(path("pronunciation.dict"), "hallo HH AA L OW\n");
    }
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static Bundle bundle;
    if (size == 0) {
        return 0;
    }
    bundle.reset();
    const char *file = Files[data[0] % std::size(Files)];
    if (qstrcmp(file, "acoustic/sendump") == 0) {
        QFile::remove(bundle.path("acoustic/mixture_weights")); // the compressed weights stand alone
    }
    write(bundle.path(file), QByteArray(reinterpret_cast<const char *>(data + 1), qsizetype(size - 1)));
    PocketsphinxModelFiles files;
    QString reason;
    if (!files.resolve(bundle.model, &reason) && reason.isEmpty()) {
        __builtin_trap(); // a bundle left out is logged by its reason, so there must be one
    }
    return 0;
}
