// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechSynthesizer.h"

#include "core/SpeechNames.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/services/UserLocaleService.h"
#include "core/speech-items/CZSpeechItem_p.h"

#include <QAtomicInteger>

#include <cmath>
#include <limits>

namespace Cadenza {

using Platform::Services;
using Platform::SpeechSynthesisService;

const QString kVoiceSettingsVoiceIdentifierKey = QStringLiteral("VoiceIdentifier");
const QString kVoiceSettingsCustomRelativeRateKey = QStringLiteral("CustomRelativeRate");
const QString kVoiceSettingsCustomVolumeKey = QStringLiteral("CustomVolume");

namespace {
constexpr double FixedOne = 65536.0;

qint64 nextChannelHandle()
{
    static QAtomicInteger<qint64> next(1);
    return next.fetchAndAddRelaxed(1);
}

bool isNumberType(QMetaType type)
{
    switch (type.id()) {
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
    case QMetaType::Double:
    case QMetaType::Float:
    case QMetaType::Long:
    case QMetaType::ULong:
    case QMetaType::Short:
    case QMetaType::UShort:
        return true;
    default:
        return false;
    }
}

// Values of 4-byte properties are 32-bit on the channel; out-of-range writes are held at the ends.
qint64 toChannelInt32(qint64 value)
{
    return std::clamp<qint64>(value, std::numeric_limits<qint32>::min(), std::numeric_limits<qint32>::max());
}

} // namespace

SpeechSynthesizer::SpeechSynthesizer(const QString &voice, int normalRate, int normalPitch)
    : m_voice(voice)
    , m_normalRate(float(normalRate))
    , m_rate(float(normalRate))
    , m_pitchBase(qint64(normalPitch) * 65536)
    , m_volume(65536)
    , m_channel(nextChannelHandle())
{ }

void SpeechSynthesizer::listenTo(SpeechSynthesisService &service)
{
    // Tests may swap the service between utterances; hear the one that speaks.
    if (m_service == &service) {
        return;
    }
    if (m_service) {
        disconnect(m_service, nullptr, this, nullptr);
    }
    m_service = &service;
    connect(
        &service, &SpeechSynthesisService::speakingFinished, this, [this](quint64 request, bool completed) {
            if (request == 0 || request != m_request) {
                return;
            }
            m_request = 0;
            Q_EMIT didFinishSpeaking(completed);
        });
}

SpeechSynthesizer::~SpeechSynthesizer()
{
    if (m_request) {
        stopSpeaking();
    }
}

std::unique_ptr<SpeechSynthesizer> SpeechSynthesizer::initWithVoice(const QString &voiceIdentifier)
{
    SpeechSynthesisService &service = Services::speechSynthesis();
    const QString identifier = voiceIdentifier.isNull() ? service.defaultVoice() : voiceIdentifier;
    const auto description = service.voice(identifier);
    if (!description) {
        return nullptr;
    }
    return std::unique_ptr<SpeechSynthesizer>(
        new SpeechSynthesizer(identifier, description->engineRate, description->enginePitch));
}

std::unique_ptr<SpeechSynthesizer> SpeechSynthesizer::initWithVoiceSettings(const QVariantMap &settings)
{
    const QVariant voice = settings.value(kVoiceSettingsVoiceIdentifierKey);
    auto synthesizer = initWithVoice(voice.typeId() == QMetaType::QString ? voice.toString() : QString());
    if (!synthesizer) {
        return nullptr;
    }
    const QVariant rate = settings.value(kVoiceSettingsCustomRelativeRateKey);
    if (SpeechItemPrivate::isNumber(rate)) {
        synthesizer->setSpeechRate(float(synthesizer->_normalSpeakingRate() * rate.toDouble()));
    }
    const QVariant volume = settings.value(kVoiceSettingsCustomVolumeKey);
    if (SpeechItemPrivate::isNumber(volume)) {
        synthesizer->setObject(qint64(volume.toDouble() * FixedOne), VolumeProperty, 4);
    }
    return synthesizer;
}

float SpeechSynthesizer::_normalSpeakingRate() const
{
    return m_normalRate;
}

Platform::SpeechRequest SpeechSynthesizer::speechRequest(const QString &text) const
{
    Platform::SpeechRequest request;
    request.text = text;
    request.voiceIdentifier = m_voice;
    request.wordsPerMinute = m_rate;
    request.pitch = double(m_pitchBase) / FixedOne;
    request.volume = qBound(0.0, double(m_volume) / FixedOne, 1.0);
    return request;
}

bool SpeechSynthesizer::startSpeakingString(const QString &text)
{
    if (m_request) {
        stopSpeaking();
    }
    SpeechSynthesisService &service = Services::speechSynthesis();
    listenTo(service);
    m_request = service.startSpeaking(speechRequest(text));
    return m_request != 0;
}

bool SpeechSynthesizer::startSpeakingStringToFile(const QString &text, const QString &wavPath, QString *error)
{
    return Services::speechSynthesis().renderToFile(speechRequest(text), wavPath, error);
}

void SpeechSynthesizer::stopSpeaking()
{
    if (m_request) {
        // The service reports the stop through speakingFinished, which clears m_request.
        if (m_service) {
            m_service->stopSpeaking();
        }
        m_request = 0;
    }
}

QVariant SpeechSynthesizer::_objectForProperty(quint32 property, int dataSize, QMetaType requestedType) const
{
    if (!isNumberType(requestedType)) {
        return {};
    }
    switch (property) {
    case PitchBaseProperty:
        return dataSize == 4 ? QVariant(m_pitchBase) : QVariant();
    case VolumeProperty:
        return dataSize == 4 ? QVariant(m_volume) : QVariant();
    case SpeechChannelProperty:
        return dataSize == 8 ? QVariant(m_channel) : QVariant();
    default:
        return {};
    }
}

bool SpeechSynthesizer::_setObjectForProperty(const QVariant &object, quint32 property, int dataSize)
{
    if (!SpeechItemPrivate::isNumber(object) || dataSize != 4) {
        return false;
    }
    const qint64 value = toChannelInt32(object.toLongLong());
    switch (property) {
    case PitchBaseProperty:
        m_pitchBase = value;
        return true;
    case VolumeProperty:
        m_volume = value;
        if (m_request && m_service) {
            m_service->setSpeakingVolume(qBound(0.0, double(value) / FixedOne, 1.0));
        }
        return true;
    default:
        return false;
    }
}

float SpeechSynthesizer::speechPitch() const
{
    const QVariant value = objectForProperty(PitchBaseProperty, 4, QMetaType::fromType<qint64>());
    if (!value.isValid()) {
        return 0.0f;
    }
    return float(double(value.toLongLong()) * (1.0 / FixedOne));
}

void SpeechSynthesizer::setSpeechPitch(float pitch)
{
    // Truncation toward zero, not rounding: a round trip may lose one unit of the last place.
    setObject(QVariant(qint64(double(pitch) * FixedOne)), PitchBaseProperty, 4);
}

qint64 SpeechSynthesizer::_speechChannel() const
{
    return _objectForProperty(SpeechChannelProperty, 8, QMetaType::fromType<qint64>()).toLongLong();
}

QStringList SpeechSynthesizer::allVoices()
{
    return Services::speechSynthesis().voiceIdentifiersInGroups(
        {SpeechSynthesisService::DefaultVoiceGroup, SpeechSynthesisService::CompactVoiceGroup});
}

QStringList SpeechSynthesizer::avaliableMainstreamVoices()
{
    return Services::speechSynthesis().availableVoices();
}

QString SpeechSynthesizer::defaultVoiceFromAllVoices()
{
    // Every value() reads the domain again when its file changed, so no synchronize() first.
    Platform::PreferencesStore &preferences = Services::preferences();
    const QVariant creator
        = preferences.value(SpeechNames::SelectedVoiceCreatorKey, SpeechNames::VoicePreferencesDomain);
    const QVariant id = SpeechItemPrivate::isNumber(creator)
        ? preferences.value(SpeechNames::SelectedVoiceIDKey, SpeechNames::VoicePreferencesDomain)
        : QVariant();
    SpeechSynthesisService &service = Services::speechSynthesis();
    const QString locale = service.speechLanguageLocale().value_or(QString());
    // The key names every input of the answer besides the voices, so that a preference change is a
    // new question; a change of the voices forgets every answer.
    QString key = QStringLiteral("defaultVoiceFromAllVoices|");
    if (SpeechItemPrivate::isNumber(creator)) {
        key += QString::number(creator.toLongLong()) + QLatin1Char('/')
            + (SpeechItemPrivate::isNumber(id) ? QString::number(id.toLongLong()) : QStringLiteral("-"));
    }
    key += QLatin1Char('|') + locale;
    if (locale.isEmpty()) {
        key += QLatin1Char('|') + Services::userLocale().preferredLanguages().value(0);
    }
    return service.rememberedForVoices(key, [&] {
        if (SpeechItemPrivate::isNumber(creator)) {
            const qint32 idValue = SpeechItemPrivate::isNumber(id) ? qint32(id.toLongLong()) : 0;
            const QString identifier = service.voiceIdentifierForSpec(qint32(creator.toLongLong()), idValue);
            if (!identifier.isEmpty()) {
                return identifier;
            }
        }
        return service.preferredVoiceForLocale(allVoices(), locale);
    });
}

QString SpeechSynthesizer::defaultVoiceFromMainstreamVoices()
{
    return Services::speechSynthesis().defaultVoice();
}

QString SpeechSynthesizer::resolveVoiceIdentifier(const QString &identifier, const QStringList &usingVoices)
{
    if (identifier.isNull()) {
        return {};
    }
    // Short identifiers are too likely to be the start of unrelated voices to match by prefix.
    const bool prefixMatching = identifier.size() >= 36;
    QString firstPrefixMatch;
    QString secondPrefixMatch;
    for (const QString &voice : usingVoices) {
        if (voice == identifier) {
            return voice;
        }
        if (prefixMatching && voice.startsWith(identifier)) {
            if (firstPrefixMatch.isNull()) {
                firstPrefixMatch = voice;
            } else if (secondPrefixMatch.isNull()) {
                secondPrefixMatch = voice;
            }
        }
    }
    if (!secondPrefixMatch.isNull() && secondPrefixMatch.endsWith(QLatin1String("premium"))) {
        return secondPrefixMatch;
    }
    return firstPrefixMatch;
}

} // namespace Cadenza
