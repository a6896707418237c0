// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognizerFixture.h"

#include "core/formats/PropertyList.h"

#include <QDir>
#include <QFile>
#include <QRegularExpression>

#include <algorithm>
#include <vector>

namespace Cadenza::Testing {

namespace {

void writeFile(const QString &path, const QByteArray &content)
{
    QDir().mkpath(path.left(path.lastIndexOf(QLatin1Char('/'))));
    QFile file(path);
    if (file.open(QIODevice::WriteOnly)) {
        file.write(content);
    }
}

QVariantMap modelInfo(const QString &locale)
{
    return {{QStringLiteral("BundleIdentifier"),
                QString(QStringLiteral("com.vendra.speech.recognition.") + locale)},
        {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
        {QStringLiteral("LocaleIdentifier"), locale},
        {QStringLiteral("RecognitionEngine"), QStringLiteral("pocketsphinx")},
        {QStringLiteral("RecognitionModel"),
            QVariantMap {{QStringLiteral("AcousticModel"), QStringLiteral("Resources/acoustic")},
                {QStringLiteral("LanguageModel"), QStringLiteral("Resources/language.lm.bin")},
                {QStringLiteral("Dictionary"), QStringLiteral("Resources/pronunciation.dict")}}}};
}

/// A table file of an acoustic model: header, byte-order word, @p counts, then that many floats.
QByteArray tableFile(const QList<quint32> &counts, quint32 floats)
{
    QByteArray bytes("s3\nversion 1.0\nchksum0 yes\nendhdr\n");
    const auto word = [&bytes](quint32 value) { bytes.append(reinterpret_cast<const char *>(&value), 4); };
    word(0x11223344);
    for (const quint32 count : counts) {
        word(count);
    }
    word(floats);
    for (quint32 i = 0; i < floats; ++i) {
        word(0);
    }
    word(0); // checksum
    return bytes;
}

} // namespace

double RecognizerFixture::wordErrorRate(const QString &reference, const QString &hypothesis)
{
    const auto words = [](const QString &text) {
        QString cleaned = text.toLower();
        cleaned.replace(QRegularExpression(QStringLiteral("[^a-z' ]")), QStringLiteral(" "));
        return cleaned.split(QLatin1Char(' '), Qt::SkipEmptyParts);
    };
    const QStringList a = words(reference);
    const QStringList b = words(hypothesis);
    std::vector<int> previous(size_t(b.size()) + 1);
    std::vector<int> current(previous.size());
    for (size_t j = 0; j < previous.size(); ++j) {
        previous[j] = int(j);
    }
    for (qsizetype i = 1; i <= a.size(); ++i) {
        current[0] = int(i);
        for (qsizetype j = 1; j <= b.size(); ++j) {
            current[size_t(j)] = std::min({previous[size_t(j)] + 1, current[size_t(j - 1)] + 1,
                previous[size_t(j - 1)] + (a[i - 1] == b[j - 1] ? 0 : 1)});
        }
        std::swap(previous, current);
    }
    return a.isEmpty() ? 0.0 : double(previous.back()) / double(a.size());
}

QString RecognizerFixture::debianModelFolder()
{
    return QStringLiteral(CADENZA_POCKETSPHINX_MODEL_DIR);
}

QString RecognizerFixture::writeBareBundle(
    const QString &folder, const QString &name, const QVariantMap &info)
{
    const QString bundle = folder + QLatin1Char('/') + name;
    writeFile(bundle + QStringLiteral("/Info.plist"), Platform::PropertyList::serialize(info));
    return bundle;
}

QString RecognizerFixture::writeModelBundle(const QString &folder, const QString &locale)
{
    const QString bundle
        = writeBareBundle(folder, locale + QStringLiteral(".SpeechRecognition"), modelInfo(locale));
    const QString model = debianModelFolder();
    QDir().mkpath(bundle + QStringLiteral("/Resources"));
    QFile::link(model + QStringLiteral("/en-us"), bundle + QStringLiteral("/Resources/acoustic"));
    QFile::link(
        model + QStringLiteral("/en-us.lm.bin"), bundle + QStringLiteral("/Resources/language.lm.bin"));
    QFile::link(model + QStringLiteral("/cmudict-en-us.dict"),
        bundle + QStringLiteral("/Resources/pronunciation.dict"));
    return bundle;
}

QStringList RecognizerFixture::modelFiles()
{
    QStringList files;
    for (const QString &name :
        QDir(debianModelFolder() + QStringLiteral("/en-us")).entryList(QDir::Files, QDir::Name)) {
        if (name != QStringLiteral("README")) {
            files.append(QStringLiteral("acoustic/") + name);
        }
    }
    files << QStringLiteral("language.lm.bin") << QStringLiteral("pronunciation.dict");
    return files;
}

QString RecognizerFixture::writeDamagedBundle(
    const QString &folder, const QString &locale, const QString &file, Damage damage)
{
    const QString bundle
        = writeBareBundle(folder, locale + QStringLiteral(".SpeechRecognition"), modelInfo(locale));
    const QString model = debianModelFolder();
    const QString resources = bundle + QStringLiteral("/Resources/");
    QDir().mkpath(resources + QStringLiteral("acoustic"));
    const auto original = [&model](const QString &name) -> QString {
        if (name == QStringLiteral("language.lm.bin")) {
            return model + QStringLiteral("/en-us.lm.bin");
        }
        if (name == QStringLiteral("pronunciation.dict")) {
            return model + QStringLiteral("/cmudict-en-us.dict");
        }
        return model + QStringLiteral("/en-us/") + name.mid(int(qstrlen("acoustic/")));
    };
    for (const QString &name : modelFiles()) {
        if (name != file) {
            QFile::link(original(name), resources + name);
            continue;
        }
        QFile source(original(name));
        QByteArray bytes = source.open(QIODevice::ReadOnly) ? source.readAll() : QByteArray();
        switch (damage) {
        case Damage::Truncated:
            bytes.truncate(bytes.size() / 2);
            break;
        case Damage::Zeroed:
            bytes.fill('\0');
            break;
        case Damage::WrongMagic:
            bytes.replace(0, 4, "\x7f\x45\x4c\x46");
            break;
        }
        writeFile(resources + name, bytes);
    }
    return bundle;
}

QString RecognizerFixture::writeTinyBundle(
    const QString &folder, const QString &locale, const QString &bundleName)
{
    const QString bundle = writeBareBundle(folder,
        bundleName.isEmpty() ? locale + QStringLiteral(".SpeechRecognition") : bundleName, modelInfo(locale));
    const QString resources = bundle + QStringLiteral("/Resources/");
    writeFile(resources + QStringLiteral("acoustic/mdef"), "0.3\n0 n_base\n");
    // One mixture of one density in one stream of one dimension; one matrix of one state.
    writeFile(resources + QStringLiteral("acoustic/means"), tableFile({1, 1, 1, 1}, 1));
    writeFile(resources + QStringLiteral("acoustic/variances"), tableFile({1, 1, 1, 1}, 1));
    writeFile(resources + QStringLiteral("acoustic/transition_matrices"), tableFile({1, 1, 2}, 2));
    writeFile(resources + QStringLiteral("acoustic/mixture_weights"), tableFile({1, 1, 1}, 1));
    writeFile(resources + QStringLiteral("acoustic/feat.params"), "-feat 1s_c_d_dd\n");
    writeFile(resources + QStringLiteral("language.lm.bin"), "\\data\\\nngram 1=0\n\\end\\\n");
    writeFile(resources + QStringLiteral("pronunciation.dict"), "hallo HH AA L OW\n");
    return bundle;
}

} // namespace Cadenza::Testing
