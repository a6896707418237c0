#include "SpeechSynthesizer.h"

#include "platform/PreferencesStore.h"
#include "platform/Services.h"
#include "platform/SpeechSynthesisService.h"
#include "speech-items/CZSpeechItem_p.h"

namespace Cadenza {

using Platform::Services;
using Platform::SpeechSynthesisService;

namespace {
const QString VoicePreferencesDomain = QStringLiteral("com.vendra.speech.voice.prefs");

} // namespace

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
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(VoicePreferencesDomain);
    const QVariant creator
        = preferences.value(QStringLiteral("SelectedVoiceCreator"), VoicePreferencesDomain);
    SpeechSynthesisService &service = Services::speechSynthesis();
    if (SpeechItemPrivate::isNumber(creator)) {
        const QVariant id = preferences.value(QStringLiteral("SelectedVoiceID"), VoicePreferencesDomain);
        const qint32 idValue = SpeechItemPrivate::isNumber(id) ? qint32(id.toLongLong()) : 0;
        const QString identifier = service.voiceIdentifierForSpec(qint32(creator.toLongLong()), idValue);
        if (!identifier.isEmpty()) {
            return identifier;
        }
    }
    return service.preferredVoiceForLocale(allVoices(), service.speechLanguageLocale().value_or(QString()));
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
