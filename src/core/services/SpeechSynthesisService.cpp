// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechSynthesisService.h"

#include "PreferencesStore.h"
#include "Services.h"
#include "UserLocaleService.h"
#include "core/SpeechNames.h"
#include "core/formats/Locale.h"

#include <QHash>

namespace Cadenza::Platform {

const QString SpeechSynthesisService::SpeechLanguageKey = QStringLiteral("SpeechLanguageLocale");

namespace {

int qualityRank(const QString &identifier)
{
    switch (VoiceDescription::qualityOf(identifier)) {
    case VoiceQuality::Premium:
        return 2;
    case VoiceQuality::Default:
        return 1;
    case VoiceQuality::Compact:
        return 0;
    }
    return 0;
}

std::optional<qint32> storedInteger(const QVariant &v)
{
    switch (v.typeId()) {
    case QMetaType::LongLong:
    case QMetaType::Int:
    case QMetaType::ULongLong:
    case QMetaType::Double:
        return qint32(v.toLongLong());
    default:
        return std::nullopt;
    }
}

} // namespace

struct SpeechSynthesisService::Catalog
{
    quint64 generation = 0;
    QList<VoiceDescription> voices;
    QHash<QString, qsizetype> positionOf;
    QList<LocaleComponents> locales; // parallel to voices
    QList<qint64> desirability; // parallel to voices
    QStringList available;
    // Answers of voiceIdentifiersInGroups(), filled on demand; guarded by m_catalogMutex.
    mutable QHash<QStringList, QStringList> byGroups;
    // Answers of rememberedForVoices(); guarded by m_catalogMutex.
    mutable QHash<QString, QString> remembered;
};

std::shared_ptr<const SpeechSynthesisService::Catalog> SpeechSynthesisService::catalog()
{
    QList<VoiceDescription> voices = installedVoices();
    const quint64 generation = voicesGeneration();
    QMutexLocker locker(&m_catalogMutex);
    if (m_catalog && m_catalog->generation == generation) {
        return m_catalog;
    }
    auto made = std::make_shared<Catalog>();
    made->generation = generation;
    made->voices = std::move(voices);
    made->positionOf.reserve(made->voices.size());
    made->locales.reserve(made->voices.size());
    QHash<QString, qsizetype> positionOfBase;
    for (qsizetype i = 0; i < made->voices.size(); ++i) {
        const VoiceDescription &voice = made->voices.at(i);
        made->positionOf.insert(voice.identifier, i);
        QString locale = voice.attributes.value(VoiceAttribute::LocaleIdentifier).toString();
        if (locale.isEmpty()) {
            locale = voice.attributes.value(VoiceAttribute::Language).toString();
        }
        made->locales.append(Locale::componentsFromLocaleIdentifier(locale));
        made->desirability.append(voice.attributes.value(VoiceAttribute::RelativeDesirability).toLongLong());

        const QString base = VoiceDescription::baseIdentifierOf(voice.identifier);
        const auto it = positionOfBase.constFind(base);
        if (it == positionOfBase.cend()) {
            positionOfBase.insert(base, made->available.size());
            made->available.append(voice.identifier);
        } else if (qualityRank(voice.identifier) > qualityRank(made->available.at(*it))) {
            made->available[*it] = voice.identifier;
        }
    }
    m_catalog = made;
    return made;
}

SpeechSynthesisService::SpeechSynthesisService(QObject *parent)
    : QObject(parent)
{ }

SpeechSynthesisService::~SpeechSynthesisService() = default;

QStringList SpeechSynthesisService::voiceIdentifiersInGroups(const QStringList &groups)
{
    const auto snapshot = catalog();
    {
        QMutexLocker locker(&m_catalogMutex);
        if (auto it = snapshot->byGroups.constFind(groups); it != snapshot->byGroups.cend()) {
            return *it;
        }
    }
    QStringList result;
    result.reserve(snapshot->voices.size());
    for (const auto &voice : snapshot->voices) {
        for (const QString &group : voice.groups) {
            if (groups.contains(group)) {
                result.append(voice.identifier);
                break;
            }
        }
    }
    QMutexLocker locker(&m_catalogMutex);
    snapshot->byGroups.insert(groups, result);
    return result;
}

QString SpeechSynthesisService::rememberedForVoices(
    const QString &key, const std::function<QString()> &compute)
{
    const auto snapshot = catalog();
    {
        QMutexLocker locker(&m_catalogMutex);
        if (auto it = snapshot->remembered.constFind(key); it != snapshot->remembered.cend()) {
            return *it;
        }
    }
    const QString answer = compute();
    QMutexLocker locker(&m_catalogMutex);
    // Computed against this snapshot's voices, the answer belongs to it even if the voices changed since.
    snapshot->remembered.insert(key, answer);
    return answer;
}

QStringList SpeechSynthesisService::availableVoices()
{
    return catalog()->available;
}

QString SpeechSynthesisService::defaultVoice()
{
    const QStringList available = availableVoices();
    PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(SpeechNames::VoicePreferencesDomain);
    const auto creator = storedInteger(
        preferences.value(SpeechNames::SelectedVoiceCreatorKey, SpeechNames::VoicePreferencesDomain));
    if (creator) {
        const auto id = storedInteger(
            preferences.value(SpeechNames::SelectedVoiceIDKey, SpeechNames::VoicePreferencesDomain));
        const QString selected = voiceIdentifierForSpec(*creator, id.value_or(0));
        if (!selected.isEmpty()) {
            const QString base = VoiceDescription::baseIdentifierOf(selected);
            for (const QString &candidate : available) {
                if (VoiceDescription::baseIdentifierOf(candidate) == base) {
                    return candidate;
                }
            }
        }
    }
    return preferredVoiceForLocale(available, speechLanguageLocale().value_or(QString()));
}

QVariantMap SpeechSynthesisService::attributesForVoice(const QString &identifier)
{
    const auto found = voice(identifier);
    return found ? found->attributes : QVariantMap();
}

std::optional<VoiceDescription> SpeechSynthesisService::voice(const QString &identifier)
{
    const auto snapshot = catalog();
    const auto it = snapshot->positionOf.constFind(identifier);
    if (it == snapshot->positionOf.cend()) {
        return std::nullopt;
    }
    return snapshot->voices.at(*it);
}

QString SpeechSynthesisService::voiceIdentifierForSpec(qint32 creator, qint32 id)
{
    const auto snapshot = catalog();
    for (const auto &voice : snapshot->voices) {
        if (voice.spec && voice.spec->first == creator && voice.spec->second == id) {
            return voice.identifier;
        }
    }
    return {};
}

QString SpeechSynthesisService::preferredVoiceForLocale(
    const QStringList &identifiers, const QString &localeIdentifier)
{
    if (identifiers.isEmpty()) {
        return {};
    }
    QString wanted = localeIdentifier;
    if (wanted.isEmpty()) {
        const QStringList languages = Services::userLocale().preferredLanguages();
        wanted = languages.isEmpty() ? QStringLiteral("en_US") : languages.first();
    }
    const LocaleComponents target = Locale::componentsFromLocaleIdentifier(wanted);

    const auto snapshot = catalog();
    QString best;
    std::tuple<int, qint64, int> bestScore {0, 0, 0};
    for (const QString &identifier : identifiers) {
        const auto position = snapshot->positionOf.constFind(identifier);
        if (position == snapshot->positionOf.cend()) {
            continue;
        }
        const LocaleComponents &components = snapshot->locales.at(*position);
        if (components.languageCode.isEmpty()
            || components.languageCode.compare(target.languageCode, Qt::CaseInsensitive) != 0) {
            continue;
        }
        const int localeScore
            = components.countryCode.compare(target.countryCode, Qt::CaseInsensitive) == 0 ? 2 : 1;
        const std::tuple<int, qint64, int> score {
            localeScore, snapshot->desirability.at(*position), qualityRank(identifier)};
        if (best.isEmpty() || score > bestScore) {
            best = identifier;
            bestScore = score;
        }
    }
    if (!best.isEmpty()) {
        return best;
    }
    if (identifiers.contains(SpeechNames::OrinIdentifier)) {
        return SpeechNames::OrinIdentifier;
    }
    return identifiers.first();
}

} // namespace Cadenza::Platform
