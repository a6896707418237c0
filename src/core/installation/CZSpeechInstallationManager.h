// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_H
#define CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QObject>
#include <QVariantList>

#include <memory>
#include <optional>
#include <variant>

namespace Cadenza {

class CZSRLanguageItem;
class CZSpeechItem;
class CZVoiceObject;
class DownloadableVoice;
using CZSRLanguageItemPtr = std::shared_ptr<CZSRLanguageItem>;
using CZSpeechItemPtr = std::shared_ptr<CZSpeechItem>;
using CZVoiceObjectPtr = std::shared_ptr<CZVoiceObject>;
using DownloadableVoicePtr = std::shared_ptr<DownloadableVoice>;

/// An installed bundle on disk.
struct CADENZACORE_EXPORT SpeechBundle
{
    QString path;
};

/// Something the user asked to remove: a voice or a recognition language.
using RemovableSpeechItem = std::variant<CZVoiceObjectPtr, CZSRLanguageItemPtr>;

class CZSpeechInstallationManagerPrivate;

/// Told when the installer daemon has finished with a requested item.
class CADENZACORE_EXPORT CZSpeechInstallationManagerDelegate
{
public:
    virtual ~CZSpeechInstallationManagerDelegate();
    /// @p tags holds the item's tag; @p message is 1 (installed), 2 (cancelled) or 3 (failed).
    virtual void speechItemTags(const QStringList &tags, qint32 finishedWithMessage) = 0;
};

/**
 * The process's door to the speech-data installer daemon: installation requests, the running
 * installations, cancelling, and the completion of each request.
 *
 * Requests block the calling (main) thread for at most 10 seconds to send and, for the list of
 * running installations, 10 seconds more for the answer. Completions arrive on the main thread.
 */
class CADENZACORE_EXPORT CZSpeechInstallationManager : public QObject
{
    Q_OBJECT
public:
    /// The one manager of the process, made on first use.
    static CZSpeechInstallationManager *sharedManager();

    explicit CZSpeechInstallationManager(QObject *parent = nullptr);
    ~CZSpeechInstallationManager() override;

    /// The key of the installation log in both preference domains (see SpeechNames).
    static const QString InstallationLogKey; ///< "SpeechDataInstallationLog"

    [[nodiscard]] std::shared_ptr<CZSpeechInstallationManagerDelegate> delegate() const;
    void setDelegate(std::shared_ptr<CZSpeechInstallationManagerDelegate> delegate);

    /// The daemon's status records of every running or waiting installation; empty when it is not running.
    [[nodiscard]] QVariantList activeInstallations();
    /// The same as activeInstallations().
    [[nodiscard]] QVariantList activeVoiceInstallations();
    void showProgressWindow();
    void cancelAllInstallations();

    // Downloadable speech data.
    /// The catalogue's voices that are not installed, or whose installed quality can be upgraded,
    /// with their status from the running installations.
    [[nodiscard]] QList<DownloadableVoicePtr> downloadableVoices();
    /// The catalogue's recognition languages that are not installed here.
    [[nodiscard]] QList<CZSRLanguageItemPtr> downloadableSRLanguageItems();
    [[nodiscard]] DownloadableVoicePtr downloadableVoiceUpgradeForVoice(
        const CZVoiceObject &voice, const QList<DownloadableVoicePtr> &fromDownloadableVoices);
    /// How an installer status record names a voice.
    enum class RecordMatch { None, AsAsked, FullSize };
    /**
     * Whether status record @p record is about @p voice. The daemon may name the voice it installs
     * (a voice's full-size bundle) rather than the one asked for, so a downloadable voice is also
     * named by its full-size identifier or either of its tags; FullSize says the record fetches that.
     */
    [[nodiscard]] static RecordMatch installationRecordMatch(
        const QVariantMap &record, const CZVoiceObject &voice);
    /// The first of @p records about @p voice, and how it names it.
    [[nodiscard]] static std::pair<QVariantMap, RecordMatch> installationRecordForVoice(
        const QVariantList &records, const CZVoiceObject &voice);
    /// There are no upgrades of recognition languages: always null.
    [[nodiscard]] CZSpeechItemPtr downloadableSpeechItemUpgradeForExistingSpeechItem(
        const CZSpeechItemPtr &item, const QList<CZSRLanguageItemPtr> &fromDownloadableItems);
    /// One request per voice; true when at least one was sent. "DoNotDownloadVoices" set to 0 blocks.
    bool startInstallingDownloadableVoices(
        const QList<DownloadableVoicePtr> &voices, bool useRootNames, qint64 userInteractionMode);
    /// One request per language; true when at least one was sent. "DoNotDownloadLanguages" set to 0 blocks.
    bool startInstallingDownloadableSpeechItems(
        const QList<CZSRLanguageItemPtr> &items, qint64 userInteractionMode);
    /// Removes the items' bundles with administrator rights, later on the main thread, and logs each removal.
    void startRemovingDownloadedSpeechItems(const QList<RemovableSpeechItem> &items);
    [[nodiscard]] std::optional<SpeechBundle> bundleForRemovableVoice(
        const CZVoiceObject &voice, QString *passingBackTagName);
    [[nodiscard]] std::optional<SpeechBundle> bundleForRemovableLanguage(
        const CZSRLanguageItem &item, QString *passingBackTagName);
    [[nodiscard]] QString onDiskVersionForBundlePath(const QString &bundlePath);
    [[nodiscard]] std::optional<QVariantMap> installationLogEntryForTag(const QString &tag);
    [[nodiscard]] std::optional<QVariantMap> installationLogEntryForTag(
        const QString &tag, const QString &preferenceDomain);

    // The background download policy.
    [[nodiscard]] bool isRunningOnACPower();
    void markDownloadableVoiceObject(const DownloadableVoice &voice, bool withAutoDownloadProhibitFlag);
    [[nodiscard]] bool isAutoDownloadProhibitedForDownloadableVoiceObject(const DownloadableVoice &voice);
    /// The best installed quality of the voice @p rootIdentifier names; may start fetching a better one.
    [[nodiscard]] QString highestQualityVoiceIdentifierForRootVoiceIdentifier(
        const QString &rootIdentifier, bool startDownloading);
    /// Starts fetching the premium quality of @p voiceIdentifier when the rules allow it.
    bool startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(const QString &voiceIdentifier);
    [[nodiscard]] bool doesLanguageDataNeedToBeDownloadedForLocaleIdentifier(const QString &localeIdentifier);

Q_SIGNALS:
    /// Emitted with each completion, after the delegate: the whole answer, which may carry
    /// "QLNDFailureReason".
    void installationFinished(const QString &tagName, qint32 message, const QVariantMap &answer);
    /// Emitted when an installation request could not be delivered to the daemon (it is not running),
    /// with the request's user-interaction mode (1: an automatic request nobody asked for).
    void installationRequestFailed(
        const QString &tagName, const QString &itemName, qint64 userInteractionMode);

private:
    friend class CZSpeechInstallationManagerPrivate;
    std::unique_ptr<CZSpeechInstallationManagerPrivate> const d;
};

/// The exported entry point of the background policy: the shared manager's
/// startDownloadingHighestQualityIfNecessaryForVoiceIdentifier().
CADENZACORE_EXPORT bool StartDownloadingHighestQualityIfNecessaryForVoiceIdentifier(
    const QString &voiceIdentifier);

} // namespace Cadenza

#endif
