// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognitionService.h"

#include "cadenzacore_logging.h"
#include "core/engines/RecognitionEngines.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/RecognizerBundleInfo.h"

#include <QDir>
#include <QFileInfo>

namespace Cadenza::Platform {

RecognitionService::~RecognitionService() = default;

namespace {

QStringList recognizerBundles(const QString &folder)
{
    const QDir dir(folder);
    QStringList paths;
    const QStringList bundles = dir.entryList(
        {QStringLiteral("*.SpeechRecognition")}, QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
    for (const QString &bundle : bundles) {
        paths.append(dir.filePath(bundle));
    }
    return paths;
}

/// "en-US" and "en_US" name the same language.
bool sameLocale(const QString &a, const QString &b)
{
    return QString(a)
               .replace(QLatin1Char('-'), QLatin1Char('_'))
               .compare(QString(b).replace(QLatin1Char('-'), QLatin1Char('_')), Qt::CaseInsensitive)
        == 0;
}

/// The locale a bundle's Info.plist gives; empty, with a readable @p reason, when it names no
/// language (such a bundle must never reach a list that titles languages by name).
QString bundleLocale(const QString &bundlePath, QVariantMap *info, QString *reason)
{
    QString error;
    const auto plist = PropertyList::readFile(bundlePath + QStringLiteral("/Info.plist"), &error);
    if (!plist) {
        *reason = error;
        return {};
    }
    const auto described = RecognizerBundleInfo::fromInfo(plist->toMap(), reason);
    if (!described) {
        return {};
    }
    *info = plist->toMap();
    return described->localeIdentifier;
}

} // namespace

std::optional<RecognizerModel> BundleRecognitionService::usableModel(
    const QString &bundlePath, QString *reason)
{
    QString ignored;
    QString &why = reason ? *reason : ignored;
    QVariantMap info;
    RecognizerModel model;
    model.bundlePath = bundlePath;
    model.localeIdentifier = bundleLocale(bundlePath, &info, &why);
    if (model.localeIdentifier.isEmpty()) {
        return std::nullopt;
    }
    model.engineName = info.value(QStringLiteral("RecognitionEngine")).toString();
    if (model.engineName.isEmpty()) {
        why = QStringLiteral("it names no recognition engine, so it carries no model");
        return std::nullopt;
    }
    model.files = info.value(QStringLiteral("RecognitionModel")).toMap();
    RecognitionEngine *engine = RecognitionEngines::engine(model.engineName, &why);
    if (!engine || !engine->checkModel(model, &why)) {
        return std::nullopt;
    }
    return model;
}

std::optional<QStringList> BundleRecognitionService::installedLanguages()
{
    QStringList languages;
    for (const QString &folder : Paths::recognizerFolders()) {
        for (const QString &bundle : recognizerBundles(folder)) {
            QString reason;
            const auto model = usableModel(bundle, &reason);
            if (!model) {
                qCWarning(lcInstallation, "Skipping recognizer bundle %s: %s", qPrintable(bundle),
                    qPrintable(reason));
                continue;
            }
            if (!languages.contains(model->localeIdentifier)) {
                languages.append(model->localeIdentifier);
            }
        }
    }
    return languages;
}

std::optional<RecognizerModel> BundleRecognitionService::modelForLocale(
    const QString &localeIdentifier, QString *reason)
{
    QString ignored;
    QString &why = reason ? *reason : ignored;
    QStringList problems;
    for (const QString &folder : Paths::recognizerFolders()) {
        for (const QString &bundle : recognizerBundles(folder)) {
            QVariantMap info;
            QString localeReason;
            if (!sameLocale(bundleLocale(bundle, &info, &localeReason), localeIdentifier)) {
                continue;
            }
            QString problem;
            if (auto model = usableModel(bundle, &problem)) {
                return model;
            }
            problems.append(QStringLiteral("%1: %2").arg(bundle, problem));
        }
    }
    why = problems.isEmpty() ? QStringLiteral("no recognizer for %1 is installed").arg(localeIdentifier)
                             : QStringLiteral("the recognizer for %1 cannot recognise (%2)")
                                   .arg(localeIdentifier, problems.join(QStringLiteral("; ")));
    return std::nullopt;
}

QString BundleRecognitionService::bundlePathForIdentifier(const QString &bundleIdentifier)
{
    if (bundleIdentifier.isEmpty()) {
        return {};
    }
    for (const QString &folder : Paths::recognizerFolders()) {
        const QDir dir(folder);
        const QStringList bundles = dir.entryList(
            {QStringLiteral("*.SpeechRecognition")}, QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
        for (const QString &bundle : bundles) {
            // Only bundles the language lists accept, so that both agree on what is installed.
            QString error;
            const auto info = RecognizerBundleInfo::fromBundle(dir.filePath(bundle), &error);
            if (info && info->bundleIdentifier == bundleIdentifier) {
                return dir.filePath(bundle);
            }
        }
    }
    return {};
}

QString BundleRecognitionService::bundlePathForLocale(const QString &localeIdentifier)
{
    if (localeIdentifier.isEmpty() || localeIdentifier.contains(QLatin1Char('/'))
        || localeIdentifier.startsWith(QLatin1Char('.'))) {
        return {};
    }
    for (const QString &folder : Paths::recognizerFolders()) {
        const QString path
            = folder + QLatin1Char('/') + localeIdentifier + QStringLiteral(".SpeechRecognition");
        if (QFileInfo(path).isDir()) {
            return path;
        }
    }
    return {};
}

} // namespace Cadenza::Platform
