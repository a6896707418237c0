// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The installation manager's background download policy: fetch the best quality of a voice on
// mains power, within the attempt limits and the user's prohibitions.

#include "CZSpeechInstallationManager.h"

#include "core/SpeechNames.h"
#include "core/formats/VoiceDescription.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/PowerSourcesInfo.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"

#include <QDateTime>

namespace Cadenza {

using namespace InstallerProtocol;
using Platform::Services;

namespace {
constexpr qint64 MaximumBackgroundAttempts = 3;
constexpr double MinimumSecondsBetweenAttempts = 342000.0; // 95 hours
constexpr qint64 AutomaticInteractionMode = 1;

double nowSinceReferenceDate()
{
    return double(QDateTime::currentMSecsSinceEpoch()) / 1000.0 - ReferenceDateOffset;
}

bool isInteger(const QVariant &value)
{
    return SpeechItemPrivate::isNumber(value);
}
} // namespace

bool CZSpeechInstallationManager::isRunningOnACPower()
{
    const auto sources = Services::powerSources().powerSources();
    // A desktop without batteries says nothing, and counts as mains powered.
    if (!sources || sources->isEmpty()) {
        return true;
    }
    for (const QVariantMap &source : *sources) {
        const QVariant state = source.value(Platform::PowerSourcesInfo::StateKey);
        if (state.isValid() && state.toString() == Platform::PowerSourcesInfo::ACPower) {
            return true;
        }
    }
    return false;
}

void CZSpeechInstallationManager::markDownloadableVoiceObject(
    const DownloadableVoice &voice, bool withAutoDownloadProhibitFlag)
{
    const QString tag = voice.tagName();
    if (tag.isEmpty()) {
        return;
    }
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(SpeechNames::VoicePreferencesDomain);
    QVariantMap log = preferences.value(InstallationLogKey, SpeechNames::VoicePreferencesDomain).toMap();
    QVariantMap entry = log.value(tag).toMap();
    entry.insert(QStringLiteral("AutoAttemptProhibited"), withAutoDownloadProhibitFlag);
    log.insert(tag, entry);
    preferences.setValue(InstallationLogKey, log, SpeechNames::VoicePreferencesDomain);
    (void)preferences.synchronize(SpeechNames::VoicePreferencesDomain);
}

bool CZSpeechInstallationManager::isAutoDownloadProhibitedForDownloadableVoiceObject(
    const DownloadableVoice &voice)
{
    if (voice.tagName().isEmpty()) {
        return false;
    }
    const auto entry = installationLogEntryForTag(voice.tagName(), SpeechNames::VoicePreferencesDomain);
    if (!entry) {
        return false;
    }
    const QVariant flag = entry->value(QStringLiteral("AutoAttemptProhibited"));
    return SpeechItemPrivate::isNumber(flag) && flag.toBool();
}

QString CZSpeechInstallationManager::highestQualityVoiceIdentifierForRootVoiceIdentifier(
    const QString &rootIdentifier, bool startDownloading)
{
    if (rootIdentifier.isNull()) {
        return {};
    }
    Platform::SpeechSynthesisService &service = Services::speechSynthesis();
    const QStringList installed
        = service.voiceIdentifiersInGroups({Platform::SpeechSynthesisService::DefaultVoiceGroup,
            Platform::SpeechSynthesisService::CompactVoiceGroup});
    QString chosen;
    qint64 best = 0;
    for (const QString &candidate : installed) {
        if (!candidate.startsWith(rootIdentifier)) {
            continue;
        }
        const QVariant desirability
            = service.attributesForVoice(candidate).value(Platform::VoiceAttribute::RelativeDesirability);
        if (isInteger(desirability)) {
            if (desirability.toLongLong() > best || chosen.isEmpty()) {
                chosen = candidate;
                best = desirability.toLongLong();
            }
        } else if (chosen.isEmpty()) {
            chosen = candidate;
        }
    }
    if (startDownloading && chosen.endsWith(QLatin1String("compact")) && isRunningOnACPower()) {
        const CZVoiceObjectPtr voice = CZVoiceObject::initWithVoiceIdentifier(chosen);
        const DownloadableVoicePtr upgrade = downloadableVoiceUpgradeForVoice(*voice, downloadableVoices());
        if (upgrade
            && (upgrade->downloadStatus() == UpgradeAvailableStatus
                || upgrade->downloadStatus() == NotInstalledStatus)) {
            (void)startInstallingDownloadableVoices({upgrade}, true, AutomaticInteractionMode);
        }
    }
    return chosen;
}

bool CZSpeechInstallationManager::startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(
    const QString &voiceIdentifier)
{
    if (!isRunningOnACPower()) {
        return false;
    }
    if (voiceIdentifier.endsWith(QLatin1String("premium"))) {
        return true; // already the best there is
    }
    const CZVoiceObjectPtr voice = CZVoiceObject::initWithVoiceIdentifier(voiceIdentifier);
    const DownloadableVoicePtr upgrade = downloadableVoiceUpgradeForVoice(*voice, downloadableVoices());
    if (!upgrade) {
        return true;
    }
    if (upgrade->downloadStatus() != UpgradeAvailableStatus
        && upgrade->downloadStatus() != NotInstalledStatus) {
        return true; // on its way already
    }
    if (installationRecordForVoice(activeInstallations(), *upgrade).second != RecordMatch::None) {
        return false;
    }
    const QString tag = upgrade->fullSizeBundleIdentifier() == voiceIdentifier ? upgrade->fullSizeTagName()
                                                                               : upgrade->tagName();
    if (const auto entry = installationLogEntryForTag(tag, SpeechNames::VoicePreferencesDomain)) {
        if (entry->contains(QStringLiteral("RemovalDate"))) {
            return false; // the user removed it
        }
        const QVariant prohibited = entry->value(QStringLiteral("AutoAttemptProhibited"));
        if (isInteger(prohibited) && prohibited.toLongLong() != 0) {
            return false;
        }
        const QVariant attempts = entry->value(QStringLiteral("BackgroundAttempts"));
        if (isInteger(attempts) && attempts.toLongLong() > MaximumBackgroundAttempts) {
            return false;
        }
        const QVariant last = entry->value(QStringLiteral("LastBackgroundAttemptDate"));
        if (SpeechItemPrivate::isNumber(last)
            && nowSinceReferenceDate() - last.toDouble() < MinimumSecondsBetweenAttempts) {
            return false;
        }
    }
    return startInstallingDownloadableVoices({upgrade}, true, AutomaticInteractionMode);
}

bool CZSpeechInstallationManager::doesLanguageDataNeedToBeDownloadedForLocaleIdentifier(
    const QString &localeIdentifier)
{
    for (const auto &item : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
        if (CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), localeIdentifier)) {
            return false;
        }
    }
    for (const QVariant &record : activeInstallations()) {
        if (CZSpeechItem::isSameLocaleIdentifier(
                record.toMap().value(ObjectIDKey).toString(), localeIdentifier)) {
            return false;
        }
    }
    return true;
}

bool StartDownloadingHighestQualityIfNecessaryForVoiceIdentifier(const QString &voiceIdentifier)
{
    return CZSpeechInstallationManager::sharedManager()
        ->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(voiceIdentifier);
}

} // namespace Cadenza
