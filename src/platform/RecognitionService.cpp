#include "RecognitionService.h"

#include "Logging.h"
#include "Paths.h"
#include "RecognizerBundleInfo.h"

#include <QDir>
#include <QFileInfo>

namespace Cadenza::Platform {

RecognitionService::~RecognitionService() = default;

std::optional<QStringList> BundleRecognitionService::installedLanguages()
{
    QStringList languages;
    const QStringList folders = Paths::recognizerFolders();
    for (const QString &folder : folders) {
        const QDir dir(folder);
        const QStringList bundles = dir.entryList(
            {QStringLiteral("*.SpeechRecognition")}, QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
        for (const QString &bundle : bundles) {
            QString error;
            const auto info = RecognizerBundleInfo::fromBundle(dir.filePath(bundle), &error);
            if (!info) {
                qCWarning(lcInstallation, "Skipping recognizer bundle %s: %s",
                    qPrintable(dir.filePath(bundle)), qPrintable(error));
                continue;
            }
            if (!languages.contains(info->localeIdentifier)) {
                languages.append(info->localeIdentifier);
            }
        }
    }
    return languages;
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
