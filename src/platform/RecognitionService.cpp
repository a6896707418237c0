#include "RecognitionService.h"

#include "Logging.h"
#include "Paths.h"
#include "PropertyList.h"

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
            const auto info
                = PropertyList::readFile(dir.filePath(bundle) + QStringLiteral("/Info.plist"), &error);
            const QVariant locale
                = info ? info->toMap().value(QStringLiteral("LocaleIdentifier")) : QVariant();
            if (locale.typeId() != QMetaType::QString || locale.toString().isEmpty()) {
                qCWarning(lcInstallation, "Skipping recognizer bundle %s: %s",
                    qPrintable(dir.filePath(bundle)),
                    qPrintable(info ? QStringLiteral("no LocaleIdentifier") : error));
                continue;
            }
            if (!languages.contains(locale.toString())) {
                languages.append(locale.toString());
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
            const auto info = PropertyList::readFile(dir.filePath(bundle) + QStringLiteral("/Info.plist"));
            if (info
                && info->toMap().value(QStringLiteral("BundleIdentifier")).toString() == bundleIdentifier) {
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
