// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PocketsphinxModelCheck.h"

#include <QFile>
#include <QFileInfo>

namespace Cadenza::Engines {

namespace {

QByteArray head(const QString &path, qint64 size)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.read(size) : QByteArray();
}

bool fileMissing(const QString &path, const QString &what, QString *reason)
{
    const QFileInfo info(path);
    if (path.isEmpty() || !info.isFile() || info.size() == 0) {
        *reason = path.isEmpty() ? QStringLiteral("the bundle names no %1").arg(what)
                                 : QStringLiteral("the %1 %2 is missing or empty").arg(what, path);
        return true;
    }
    return false;
}

/// A language model in one of the three forms pocketsphinx reads: binary trie, DMP or ARPA text.
bool plausibleLanguageModel(const QByteArray &start)
{
    if (start.startsWith("Trie Language Model")) {
        return true;
    }
    if (start.size() >= 20 && start.mid(4, 16) == "Darpa Trigram LM") {
        return true;
    }
    // ARPA text: comments may come before the data section.
    return start.contains("\\data\\");
}

/// A dictionary line is a word followed by at least one phone.
bool plausibleDictionary(const QByteArray &start)
{
    const QByteArray firstLine = start.left(start.indexOf('\n')).trimmed();
    return !firstLine.isEmpty() && firstLine.split(' ').size() >= 2 && !firstLine.contains('\0');
}

} // namespace

bool PocketsphinxModelFiles::resolve(const Platform::RecognizerModel &model, QString *reason)
{
    QString ignored;
    QString &why = reason ? *reason : ignored;
    acousticModel = model.filePath(QStringLiteral("AcousticModel"));
    languageModel = model.filePath(QStringLiteral("LanguageModel"));
    dictionary = model.filePath(QStringLiteral("Dictionary"));
    if (acousticModel.isEmpty() || !QFileInfo(acousticModel).isDir()) {
        why = acousticModel.isEmpty()
            ? QStringLiteral("the bundle names no acoustic model folder")
            : QStringLiteral("the acoustic model folder %1 is missing").arg(acousticModel);
        return false;
    }
    for (const char *part : {"mdef", "means", "variances", "transition_matrices", "feat.params"}) {
        if (fileMissing(acousticModel + QLatin1Char('/') + QLatin1String(part),
                QStringLiteral("acoustic model file"), &why)) {
            return false;
        }
    }
    const QByteArray mdef = head(acousticModel + QStringLiteral("/mdef"), 16);
    if (!mdef.startsWith("BMDF") && !mdef.startsWith("0.3")) {
        why = QStringLiteral("the acoustic model's mdef in %1 is not a model definition").arg(acousticModel);
        return false;
    }
    if (fileMissing(languageModel, QStringLiteral("language model"), &why)) {
        return false;
    }
    if (!plausibleLanguageModel(head(languageModel, 4096))) {
        why = QStringLiteral("the language model %1 is not one pocketsphinx reads").arg(languageModel);
        return false;
    }
    if (fileMissing(dictionary, QStringLiteral("dictionary"), &why)) {
        return false;
    }
    if (!plausibleDictionary(head(dictionary, 512))) {
        why = QStringLiteral("the dictionary %1 is not a pronouncing dictionary").arg(dictionary);
        return false;
    }
    return true;
}

} // namespace Cadenza::Engines
