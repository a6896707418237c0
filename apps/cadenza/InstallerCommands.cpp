#include "InstallerCommands.h"

#include "CommandLine.h"

#include "installation/CZSpeechInstallationManager.h"
#include "installation/InstallerProtocol.h"
#include "platform/PropertyList.h"

#include <QCommandLineParser>
#include <QEventLoop>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QTimer>
#include <QtMath>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;

namespace {

struct CatalogueItem
{
    QString name;
    QString objectIdentifier;
    quint64 byteSize = 0;
};

// Name, identity and size of a tag, from the catalogue built into Cadenza.
std::optional<CatalogueItem> findInCatalogue(const QString &tag)
{
    const auto catalogue
        = Platform::PropertyList::readFile(QStringLiteral(":/cadenza/SpeechDataDefaults.plist"));
    if (!catalogue) {
        return std::nullopt;
    }
    const QVariantMap voices = catalogue->toMap().value(QStringLiteral("DownloadableVoices")).toMap();
    for (auto it = voices.cbegin(); it != voices.cend(); ++it) {
        const QVariantMap entry = it.value().toMap();
        const QString name = entry.value(QStringLiteral("VoiceAttributes"))
                                 .toMap()
                                 .value(QStringLiteral("VoiceName"))
                                 .toString();
        if (entry.value(QStringLiteral("VoiceTag")).toString() == tag) {
            return CatalogueItem {name, it.key(), entry.value(QStringLiteral("VoiceByteSize")).toULongLong()};
        }
        if (entry.value(QStringLiteral("FullSizeTagName")).toString() == tag) {
            return CatalogueItem {name, entry.value(QStringLiteral("FullSizeBundleIdentifier")).toString(),
                entry.value(QStringLiteral("FullSizeByteSize")).toULongLong()};
        }
    }
    const QVariantMap languages = catalogue->toMap().value(QStringLiteral("DownloadableSRLanguages")).toMap();
    for (auto it = languages.cbegin(); it != languages.cend(); ++it) {
        const QVariantMap entry = it.value().toMap();
        if (entry.value(QStringLiteral("Tag")).toString() == tag) {
            const QString locale = entry.value(QStringLiteral("LocaleIdentifier")).toString();
            return CatalogueItem {locale, locale, entry.value(QStringLiteral("ByteSize")).toULongLong()};
        }
    }
    return std::nullopt;
}

QString describe(const QVariantMap &record)
{
    const QString name = record.value(ItemNameKey).toString();
    const qint64 state = record.value(ItemSoftwareUpdateStateKey).toLongLong();
    if (record.value(ItemDownloadStatusKey).toLongLong() == WaitingStatus) {
        return QStringLiteral("%1: waiting").arg(name);
    }
    if (state == DownloadingState) {
        const double remaining = record.value(ItemSecondsRemainingKey).toDouble();
        return QStringLiteral("%1: downloading, %2 %, %3 of %4 bytes%5")
            .arg(name)
            .arg(record.value(ItemPercentCompleteKey).toDouble(), 0, 'f', 0)
            .arg(record.value(ItemDownloadByteCountKey).toULongLong())
            .arg(record.value(ItemByteSizeKey).toULongLong())
            .arg(remaining > 0 ? QStringLiteral(", about %1 s left").arg(qCeil(remaining)) : QString());
    }
    if (state == InstallingState) {
        return QStringLiteral("%1: installing").arg(name);
    }
    return QStringLiteral("%1: preparing").arg(name);
}

} // namespace

int InstallerCommands::status(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Shows the installations that the installer daemon is working on; nothing when it is not running."));
    const QCommandLineOption json(
        QStringLiteral("json"), QStringLiteral("Print the daemon's records as JSON."));
    parser.addOption(json);
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    CZSpeechInstallationManager manager;
    const QVariantList records = manager.activeInstallations();
    if (parser.isSet(json)) {
        std::fputs(QJsonDocument(QJsonArray::fromVariantList(records)).toJson().constData(), stdout);
        return 0;
    }
    if (records.isEmpty()) {
        std::fputs(manager._serverIsRunning() ? "Nothing is being installed.\n"
                                              : "The installer daemon is not running.\n",
            stdout);
        return 0;
    }
    for (const QVariant &record : records) {
        std::fprintf(stdout, "%s\n", qPrintable(describe(record.toMap())));
    }
    return 0;
}

int InstallerCommands::install(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Asks the installer daemon to install TAG, such as "
                       "VOICEID:com.vendra.speech.synthesis.voice.jonas.premium "
                       "or SRCLANGID:de_DE, and waits until it is installed unless --no-wait is given."));
    const QCommandLineOption noWait(
        QStringLiteral("no-wait"), QStringLiteral("Return once the request is sent."));
    parser.addOption(noWait);
    parser.addPositionalArgument(QStringLiteral("TAG"), QStringLiteral("The installer tag of the item."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, QStringLiteral("give exactly one tag"));
        return 2;
    }
    const QString tag = parser.positionalArguments().first();
    CZSpeechInstallationManager manager;
    if (!manager._serverIsRunning()) {
        CommandLine::fail(arguments, QStringLiteral("the installer daemon is not running (start quillond)"));
        return 1;
    }
    // Tags the catalogue does not know still go to the daemon, which has the last word.
    const CatalogueItem item = findInCatalogue(tag).value_or(
        CatalogueItem {tag.section(QLatin1Char(':'), 1), tag.section(QLatin1Char(':'), 1), 0});
    QEventLoop loop;
    int exitCode = 1;
    QObject::connect(&manager, &CZSpeechInstallationManager::installationFinished, &loop,
        [&](const QString &finishedTag, qint32 message, const QVariantMap &answer) {
            if (finishedTag != tag) {
                return;
            }
            if (message == InstalledCompletion) {
                std::fprintf(stdout, "Installed %s\n", qPrintable(tag));
                exitCode = 0;
            } else if (message == CancelledCompletion) {
                std::fprintf(stderr, "%s: the installation of %s was cancelled\n",
                    qPrintable(arguments.first()), qPrintable(tag));
            } else {
                std::fprintf(stderr, "%s: installing %s failed: %s\n", qPrintable(arguments.first()),
                    qPrintable(tag), qPrintable(answer.value(FailureReasonKey).toString()));
            }
            loop.quit();
        });
    if (!manager._requestInstallation(tag, item.name.isEmpty() ? tag : item.name, item.byteSize,
            item.objectIdentifier.isEmpty() ? tag : item.objectIdentifier, 0)) {
        CommandLine::fail(arguments, QStringLiteral("could not send the request"));
        return 1;
    }
    if (parser.isSet(noWait)) {
        return 0;
    }
    QTimer progress;
    QString lastLine;
    QObject::connect(&progress, &QTimer::timeout, &loop, [&] {
        for (const QVariant &record : manager.activeInstallations()) {
            if (record.toMap().value(TagNameKey).toString() == tag) {
                const QString line = describe(record.toMap());
                if (line != lastLine) {
                    std::fprintf(stderr, "%s\n", qPrintable(line));
                    lastLine = line;
                }
            }
        }
        if (!manager._serverIsRunning()) {
            std::fprintf(stderr, "%s: the installer daemon stopped\n", qPrintable(arguments.first()));
            loop.exit();
        }
    });
    progress.start(500);
    loop.exec();
    return exitCode;
}

int InstallerCommands::cancel(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral("Cancels every installation of the installer daemon."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    CZSpeechInstallationManager manager;
    if (!manager._serverIsRunning()) {
        std::fputs("The installer daemon is not running.\n", stdout);
        return 0;
    }
    manager.cancelAllInstallations();
    return 0;
}
