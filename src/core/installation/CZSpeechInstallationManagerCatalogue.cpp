// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The installation manager's downloadable speech data: listing, requests, removal and the log.

#include "CZSpeechInstallationManager.h"
#include "CZSpeechInstallationManager_p.h"

#include "protocol/InstallerProtocol.h"

#include "cadenzacore_logging.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/VoiceDescription.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/AdministratorService.h"
#include "core/services/PreferencesStore.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/DownloadableVoice.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QDateTime>
#include <QFileInfo>
#include <QSet>

namespace Cadenza {

using namespace InstallerProtocol;
using Platform::Services;

const QString CZSpeechInstallationManager::InstallationLogKey = QStringLiteral("SpeechDataInstallationLog");

namespace {

// "1.10" is newer than "1.9": runs of digits compare by value, everything else character by character.
int compareVersions(const QString &a, const QString &b)
{
    qsizetype i = 0;
    qsizetype j = 0;
    while (i < a.size() && j < b.size()) {
        if (a.at(i).isDigit() && b.at(j).isDigit()) {
            qsizetype endA = i;
            qsizetype endB = j;
            while (endA < a.size() && a.at(endA).isDigit()) {
                ++endA;
            }
            while (endB < b.size() && b.at(endB).isDigit()) {
                ++endB;
            }
            // Compare by value without converting: strip leading zeros, then length, then digits.
            QStringView runA = QStringView(a).sliced(i, endA - i);
            QStringView runB = QStringView(b).sliced(j, endB - j);
            while (runA.size() > 1 && runA.front() == u'0') {
                runA = runA.sliced(1);
            }
            while (runB.size() > 1 && runB.front() == u'0') {
                runB = runB.sliced(1);
            }
            if (runA.size() != runB.size()) {
                return runA.size() < runB.size() ? -1 : 1;
            }
            if (const int c = runA.compare(runB); c != 0) {
                return c < 0 ? -1 : 1;
            }
            i = endA;
            j = endB;
            continue;
        }
        if (a.at(i) != b.at(j)) {
            return a.at(i) < b.at(j) ? -1 : 1;
        }
        ++i;
        ++j;
    }
    if (i < a.size()) {
        return 1;
    }
    return j < b.size() ? -1 : 0;
}

QVariantMap catalogueSection(const QString &key)
{
    const QVariant section = CZSpeechItem::installationDictionaryCache().value(key);
    return section.typeId() == QMetaType::QVariantMap ? section.toMap() : QVariantMap();
}

QString domainForTag(const QString &tag)
{
    return tag.startsWith(VoiceTagPrefix) ? SpeechNames::VoicePreferencesDomain
                                          : SpeechNames::RecognitionPreferencesDomain;
}

} // namespace

CZSpeechInstallationManager::RecordMatch CZSpeechInstallationManager::installationRecordMatch(
    const QVariantMap &record, const CZVoiceObject &voice)
{
    const QString objectIdentifier = record.value(ObjectIDKey).toString();
    const QString tag = record.value(TagNameKey).toString();
    if (!voice.isDownloadable()) {
        return !objectIdentifier.isEmpty() && objectIdentifier == voice.identifier() ? RecordMatch::AsAsked
                                                                                     : RecordMatch::None;
    }
    const auto &downloadable = static_cast<const DownloadableVoice &>(voice);
    const QString fullSize = downloadable.fullSizeBundleIdentifier();
    const bool distinctFullSize = !fullSize.isEmpty() && fullSize != voice.identifier();
    const bool distinctFullSizeTag = !downloadable.fullSizeTagName().isEmpty()
        && downloadable.fullSizeTagName() != downloadable.tagName();
    // The tag says what is fetched; the identifier is the client's or, rewritten, the daemon's.
    if (!tag.isEmpty()) {
        if (distinctFullSizeTag && tag == downloadable.fullSizeTagName()) {
            return RecordMatch::FullSize;
        }
        if (tag == downloadable.tagName()) {
            return RecordMatch::AsAsked;
        }
    }
    if (objectIdentifier.isEmpty()) {
        return RecordMatch::None;
    }
    if (distinctFullSize && objectIdentifier == fullSize) {
        return RecordMatch::FullSize;
    }
    return objectIdentifier == voice.identifier() ? RecordMatch::AsAsked : RecordMatch::None;
}

std::pair<QVariantMap, CZSpeechInstallationManager::RecordMatch>
CZSpeechInstallationManager::installationRecordForVoice(
    const QVariantList &records, const CZVoiceObject &voice)
{
    for (const QVariant &entry : records) {
        const QVariantMap record = entry.toMap();
        if (const RecordMatch match = installationRecordMatch(record, voice); match != RecordMatch::None) {
            return {record, match};
        }
    }
    return {{}, RecordMatch::None};
}

QList<DownloadableVoicePtr> CZSpeechInstallationManager::downloadableVoices()
{
    const QVariantList records = activeInstallations();
    const QSet<QString> installed = [] {
        const QStringList all = SpeechSynthesizer::allVoices();
        return QSet<QString>(all.cbegin(), all.cend());
    }();
    QList<DownloadableVoicePtr> result;
    const QVariantMap voices = catalogueSection(QStringLiteral("DownloadableVoices"));
    for (auto it = voices.cbegin(); it != voices.cend(); ++it) {
        DownloadableVoicePtr voice = DownloadableVoice::initWithVoiceID(it.key(), it.value());
        if (!voice) {
            continue;
        }
        const QString identifier = it.key();
        const auto [found, match] = installationRecordForVoice(records, *voice);
        const bool hasRecord = match != RecordMatch::None;
        const QVariantMap *record = &found;
        if (identifier != SpeechNames::OrinIdentifier) {
            // Installed, or installed at full size: nothing left to offer.
            if (installed.contains(identifier)
                || (!voice->fullSizeBundleIdentifier().isEmpty()
                    && installed.contains(voice->fullSizeBundleIdentifier()))) {
                continue;
            }
            if (match == RecordMatch::FullSize) {
                voice->setDownloadFullSize(true); // the row shows the size being fetched
            }
            if (hasRecord) {
                voice->setDownloadStatus(record->value(ItemDownloadStatusKey).toLongLong());
                voice->setDownloadPercentComplete(record->value(ItemPercentCompleteKey).toDouble());
            } else {
                // An upgrade when its base voice is installed: for "X.premium" that is "X" or "X.compact".
                const bool baseInstalled = Platform::VoiceDescription::isBaseVoicePresent(
                    identifier, [&installed](const QString &form) { return installed.contains(form); });
                voice->setDownloadStatus(baseInstalled ? UpgradeAvailableStatus : NotInstalledStatus);
                voice->setDownloadPercentComplete(0);
            }
        } else {
            if (installed.contains(identifier)) {
                const auto bundle = Services::speechSynthesis().voice(identifier);
                const QString onDisk = onDiskVersionForBundlePath(bundle ? bundle->bundlePath : QString());
                // A copy whose version cannot be read counts as up to date.
                if (onDisk.isNull() || compareVersions(onDisk, voice->fullSizeVersion()) >= 0) {
                    continue;
                }
                if (hasRecord) {
                    voice->setDownloadStatus(record->value(ItemDownloadStatusKey).toLongLong());
                    voice->setDownloadPercentComplete(record->value(ItemPercentCompleteKey).toDouble());
                } else {
                    voice->setDownloadStatus(UpgradeAvailableStatus);
                }
            } else if (hasRecord) {
                voice->setDownloadStatus(record->value(ItemDownloadStatusKey).toLongLong());
                voice->setDownloadPercentComplete(record->value(ItemPercentCompleteKey).toDouble());
            } else {
                voice->setDownloadStatus(NotInstalledStatus);
                voice->setDownloadPercentComplete(0);
            }
            voice->setDownloadFullSize(true);
        }
        result.append(voice);
    }
    return result;
}

QList<CZSRLanguageItemPtr> CZSpeechInstallationManager::downloadableSRLanguageItems()
{
    QSet<QString> local;
    for (const auto &item : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
        if (item->localeIdentifier().isEmpty()) {
            qCWarning(Platform::lcInstallation, "On disk SR language doesn't have locale identifier: %s",
                qPrintable(item->description()));
            continue;
        }
        local.insert(item->localeIdentifier());
    }
    const QVariantList records = activeInstallations();
    QList<CZSRLanguageItemPtr> result;
    const QVariantMap languages = catalogueSection(QStringLiteral("DownloadableSRLanguages"));
    for (auto it = languages.cbegin(); it != languages.cend(); ++it) {
        CZSRLanguageItemPtr item
            = CZSRLanguageItem::initWithDownloadableBundleIdentifier(it.key(), it.value());
        if (!item || local.contains(item->localeIdentifier())) {
            continue;
        }
        item->setDownloadStatus(NotInstalledStatus);
        for (const QVariant &record : records) {
            const QVariantMap map = record.toMap();
            if (CZSpeechItem::isSameLocaleIdentifier(
                    map.value(ObjectIDKey).toString(), item->localeIdentifier())) {
                item->setDownloadStatus(map.value(ItemDownloadStatusKey).toLongLong());
                break;
            }
        }
        result.append(item);
    }
    return result;
}

DownloadableVoicePtr CZSpeechInstallationManager::downloadableVoiceUpgradeForVoice(
    const CZVoiceObject &voice, const QList<DownloadableVoicePtr> &fromDownloadableVoices)
{
    const QString identifier = voice.identifier();
    for (const auto &candidate : fromDownloadableVoices) {
        const QString candidateIdentifier = candidate->identifier();
        if (candidateIdentifier == identifier) {
            if (identifier == SpeechNames::OrinIdentifier) {
                return candidate;
            }
            continue;
        }
        // The premium form of a voice upgrades its base voice, "X" or "X.compact".
        if (Platform::VoiceDescription::qualityOf(candidateIdentifier) == Platform::VoiceQuality::Premium
            && Platform::VoiceDescription::baseVoiceIdentifiersOf(candidateIdentifier).contains(identifier)
            && candidate->relativeDesirability() > voice.relativeDesirability()) {
            return candidate;
        }
    }
    return nullptr;
}

CZSpeechItemPtr CZSpeechInstallationManager::downloadableSpeechItemUpgradeForExistingSpeechItem(
    const CZSpeechItemPtr &, const QList<CZSRLanguageItemPtr> &)
{
    return nullptr;
}

namespace {
// A gate key blocks only when it is present, a number, and zero in its lowest byte.
bool gateBlocks(const QString &key)
{
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(SpeechNames::RecognitionPreferencesDomain);
    const QVariant value = preferences.value(key, SpeechNames::RecognitionPreferencesDomain);
    return SpeechItemPrivate::isNumber(value) && (value.toLongLong() & 0xFF) == 0;
}
} // namespace

bool CZSpeechInstallationManager::startInstallingDownloadableVoices(
    const QList<DownloadableVoicePtr> &voices, bool useRootNames, qint64 userInteractionMode)
{
    if (gateBlocks(QStringLiteral("DoNotDownloadVoices"))) {
        return false;
    }
    bool sent = false;
    for (const auto &voice : voices) {
        QString tag = voice->tagName();
        quint64 size = voice->byteSize();
        const QString name = useRootNames ? voice->displayNameRoot() : voice->displayName();
        if (voice->downloadFullSize()) {
            tag = voice->fullSizeTagName();
            size = voice->fullSizeByteSize();
        }
        sent = d->_requestInstallation(tag, name, size, voice->identifier(), userInteractionMode) || sent;
    }
    return sent;
}

bool CZSpeechInstallationManager::startInstallingDownloadableSpeechItems(
    const QList<CZSRLanguageItemPtr> &items, qint64 userInteractionMode)
{
    if (gateBlocks(QStringLiteral("DoNotDownloadLanguages"))) {
        return false;
    }
    bool sent = false;
    for (const auto &item : items) {
        item->setShowCountryInDisplayTitle(true);
        const QString name = item->displayTitle();
        item->setShowCountryInDisplayTitle(false);
        // As for voices, a language to be fetched at full size asks for the full-size package.
        const QString tag = item->downloadFullSize() ? item->fullSizeTagName() : item->tagName();
        const quint64 size = item->downloadFullSize() ? item->fullSizeByteSize() : item->byteSize();
        sent
            = d->_requestInstallation(tag, name, size, item->localeIdentifier(), userInteractionMode) || sent;
    }
    return sent;
}

void CZSpeechInstallationManager::startRemovingDownloadedSpeechItems(const QList<RemovableSpeechItem> &items)
{
    QMetaObject::invokeMethod(
        this, [this, items] { d->removeNow(items); }, Qt::QueuedConnection);
}

void CZSpeechInstallationManagerPrivate::removeNow(const QList<RemovableSpeechItem> &items)
{
    Platform::AdministratorService &administrator = Services::administrator();
    if (!administrator.isAuthenticated()) {
        // Interaction allowed (1) and rights extended (2); a refusal ends the removal without a word.
        if (!administrator.obtainRight(QStringLiteral("system.preferences"), 1 | 2)
            || !administrator.authenticate()) {
            return;
        }
    }
    for (const RemovableSpeechItem &item : items) {
        QString tag;
        std::optional<SpeechBundle> bundle;
        if (const auto *voice = std::get_if<CZVoiceObjectPtr>(&item); voice && *voice) {
            bundle = q->bundleForRemovableVoice(**voice, &tag);
        } else if (const auto *language = std::get_if<CZSRLanguageItemPtr>(&item); language && *language) {
            bundle = q->bundleForRemovableLanguage(**language, &tag);
        }
        if (bundle
            && administrator.removeBundle(bundle->path) == Platform::AdministratorService::Removal::Refused) {
            return;
        }
        if (!tag.isEmpty()) {
            logRemoval(tag);
        }
    }
}

void CZSpeechInstallationManagerPrivate::logRemoval(const QString &tag)
{
    const QString domain = domainForTag(tag);
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(domain);
    QVariantMap log = preferences.value(CZSpeechInstallationManager::InstallationLogKey, domain).toMap();
    QVariantMap entry = log.value(tag).toMap();
    entry.insert(QStringLiteral("RemovalDate"),
        double(QDateTime::currentMSecsSinceEpoch()) / 1000.0 - ReferenceDateOffset);
    log.insert(tag, entry);
    preferences.setValue(CZSpeechInstallationManager::InstallationLogKey, log, domain);
    (void)preferences.synchronize(domain);
}

std::optional<SpeechBundle> CZSpeechInstallationManager::bundleForRemovableVoice(
    const CZVoiceObject &voice, QString *passingBackTagName)
{
    const QString identifier = voice.identifier();
    const QVariantMap voices = catalogueSection(QStringLiteral("DownloadableVoices"));
    // A voice is catalogued under its own identifier, or as the full size of another entry (a voice
    // downloaded at full size); its installer tag follows.
    QVariantMap entry;
    QString tagKey = QStringLiteral("VoiceTag");
    if (voices.contains(identifier)) {
        entry = voices.value(identifier).toMap();
    } else {
        for (auto it = voices.cbegin(); !identifier.isEmpty() && it != voices.cend() && entry.isEmpty();
             ++it) {
            const QVariantMap candidate = it.value().toMap();
            if (SpeechItemPrivate::stringValue(candidate.value(QStringLiteral("FullSizeBundleIdentifier")))
                == identifier) {
                entry = candidate;
                tagKey = QStringLiteral("FullSizeTagName");
            }
        }
        if (entry.isEmpty()) {
            return std::nullopt;
        }
    }
    std::optional<SpeechBundle> bundle;
    if (identifier == SpeechNames::OrinIdentifier) {
        const auto installed = Services::speechSynthesis().voice(identifier);
        if (!installed || installed->bundlePath.isEmpty()) {
            return std::nullopt;
        }
        // An installed default voice older than the catalogue's is never removable.
        const QString onDisk = onDiskVersionForBundlePath(installed->bundlePath);
        const QString catalogued
            = SpeechItemPrivate::stringValue(entry.value(QStringLiteral("VoiceVersion")));
        if (onDisk.isNull() || compareVersions(onDisk, catalogued) < 0) {
            return std::nullopt;
        }
        bundle = SpeechBundle {installed->bundlePath};
    } else {
        if (!identifier.endsWith(QLatin1String("premium"))) {
            return std::nullopt;
        }
        const auto installed = Services::speechSynthesis().voice(identifier);
        if (installed && !installed->bundlePath.isEmpty()) {
            bundle = SpeechBundle {installed->bundlePath};
        } else {
            const QString byName = Platform::Paths::systemVoicesFolder() + QLatin1Char('/')
                + voice.displayName() + QStringLiteral(".SpeechVoice");
            if (voice.displayName().isEmpty() || voice.displayName().contains(QLatin1Char('/'))
                || !QFileInfo(byName).isDir()) {
                return std::nullopt;
            }
            bundle = SpeechBundle {byName};
        }
    }
    const QString tag = SpeechItemPrivate::stringValue(entry.value(tagKey));
    if (passingBackTagName && !tag.isNull()) {
        *passingBackTagName = tag;
    }
    return bundle;
}

std::optional<SpeechBundle> CZSpeechInstallationManager::bundleForRemovableLanguage(
    const CZSRLanguageItem &item, QString *passingBackTagName)
{
    const QString locale = item.fallbackLocaleIdentifier().isEmpty() ? item.localeIdentifier()
                                                                     : item.fallbackLocaleIdentifier();
    Platform::RecognitionService &recognition = Services::recognition();
    QString path = item.bundleIdentifier().isEmpty()
        ? QString()
        : recognition.bundlePathForIdentifier(item.bundleIdentifier());
    if (path.isEmpty()) {
        path = recognition.bundlePathForLocale(locale);
    }
    if (path.isEmpty()) {
        return std::nullopt;
    }
    if (passingBackTagName && !item.tagName().isEmpty()) {
        *passingBackTagName = item.tagName();
    }
    return SpeechBundle {path};
}

QString CZSpeechInstallationManager::onDiskVersionForBundlePath(const QString &bundlePath)
{
    if (bundlePath.isEmpty() || !QFileInfo(bundlePath).isDir()) {
        return {};
    }
    const auto info = Platform::PropertyList::readFile(bundlePath + QStringLiteral("/Info.plist"));
    if (!info || info->typeId() != QMetaType::QVariantMap) {
        return {};
    }
    return SpeechItemPrivate::stringValue(info->toMap().value(QStringLiteral("BundleVersion")));
}

std::optional<QVariantMap> CZSpeechInstallationManager::installationLogEntryForTag(const QString &tag)
{
    return installationLogEntryForTag(tag, SpeechNames::RecognitionPreferencesDomain);
}

std::optional<QVariantMap> CZSpeechInstallationManager::installationLogEntryForTag(
    const QString &tag, const QString &preferenceDomain)
{
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(preferenceDomain);
    const QVariant log = preferences.value(InstallationLogKey, preferenceDomain);
    if (log.typeId() != QMetaType::QVariantMap) {
        return std::nullopt;
    }
    const QVariant entry = log.toMap().value(tag);
    if (entry.typeId() != QMetaType::QVariantMap) {
        return std::nullopt;
    }
    return entry.toMap();
}

} // namespace Cadenza
