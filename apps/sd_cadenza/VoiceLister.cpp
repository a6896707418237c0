// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "VoiceLister.h"

#include "core/SpeechNames.h"
#include "core/formats/Locale.h"
#include "core/formats/VoiceDescription.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"

#include <QHash>
#include <QRegularExpression>

#include <algorithm>

using namespace Cadenza::Platform;

namespace SdCadenza {

namespace {

QString genderOf(const VoiceDescription &voice)
{
    const QString gender = voice.attributes.value(VoiceAttribute::Gender).toString();
    if (gender == VoiceGender::Male) {
        return QStringLiteral("male1");
    }
    if (gender == VoiceGender::Female) {
        return QStringLiteral("female1");
    }
    if (gender == VoiceGender::Neuter) {
        return QStringLiteral("child1");
    }
    return QStringLiteral("none");
}

QString languageOf(const VoiceDescription &voice)
{
    return Locale::componentsFromLocaleIdentifier(
        voice.attributes.value(VoiceAttribute::LocaleIdentifier).toString())
        .languageCode.toLower();
}

QString qualitySuffix(const QString &identifier)
{
    switch (VoiceDescription::qualityOf(identifier)) {
    case VoiceQuality::Compact:
        return QStringLiteral(" (Compact)");
    case VoiceQuality::Premium:
        return QStringLiteral(" (Premium)");
    case VoiceQuality::Default:
        break;
    }
    return {};
}

/// Whether the user chose a voice that is installed (rather than leaving the choice to the system).
bool hasSelectedVoice(SpeechSynthesisService &service)
{
    PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(Cadenza::SpeechNames::VoicePreferencesDomain);
    bool creatorOk = false;
    const int creator = preferences
                            .value(Cadenza::SpeechNames::SelectedVoiceCreatorKey,
                                Cadenza::SpeechNames::VoicePreferencesDomain)
                            .toInt(&creatorOk);
    const int id
        = preferences
              .value(Cadenza::SpeechNames::SelectedVoiceIDKey, Cadenza::SpeechNames::VoicePreferencesDomain)
              .toInt();
    return creatorOk && !service.voiceIdentifierForSpec(creator, id).isEmpty();
}

} // namespace

QString VoiceLister::bcp47(const QString &localeIdentifier)
{
    QString tag = localeIdentifier;
    tag.replace(QLatin1Char('_'), QLatin1Char('-'));
    return tag;
}

QString VoiceLister::field(const QString &text)
{
    QString out = text;
    for (QChar &c : out) {
        if (c.unicode() < 0x20 || c.unicode() == 0x7f) {
            c = QLatin1Char(' ');
        }
    }
    return out.trimmed();
}

QList<VoiceLister::Voice> VoiceLister::voices()
{
    const QList<VoiceDescription> installed = Services::speechSynthesis().installedVoices();
    QHash<QString, int> nameCount;
    for (const auto &voice : installed) {
        ++nameCount[field(voice.attributes.value(VoiceAttribute::Name).toString())];
    }
    QList<Voice> result;
    result.reserve(installed.size());
    for (const auto &voice : installed) {
        QString name = field(voice.attributes.value(VoiceAttribute::Name).toString());
        // Two qualities of one voice share a name; the listing needs one name per voice.
        if (nameCount.value(name) > 1) {
            name += qualitySuffix(voice.identifier);
        }
        result.append(
            {name, field(bcp47(voice.attributes.value(VoiceAttribute::LocaleIdentifier).toString())),
                genderOf(voice), voice.identifier});
    }
    // Two different voices of one name (and quality): the language tells them apart, else the identifier.
    for (const bool byLanguage : {true, false}) {
        QHash<QString, int> count;
        for (const Voice &voice : std::as_const(result)) {
            ++count[voice.name];
        }
        for (Voice &voice : result) {
            if (count.value(voice.name) > 1) {
                voice.name += QStringLiteral(" (%1)").arg(byLanguage ? voice.language : voice.identifier);
            }
        }
    }
    std::sort(result.begin(), result.end(), [](const Voice &a, const Voice &b) {
        return a.name == b.name ? a.identifier < b.identifier : a.name < b.name;
    });
    return result;
}

QByteArray VoiceLister::listing()
{
    QByteArray out;
    for (const Voice &voice : voices()) {
        out += "200-" + voice.name.toUtf8() + '\t' + voice.language.toUtf8() + '\t' + voice.variant.toUtf8()
            + '\n';
    }
    out += "200 OK VOICE LIST SENT\n";
    return out;
}

QString VoiceLister::choose(const QString &synthesisVoice, const QString &language, const QString &voiceType)
{
    SpeechSynthesisService &service = Services::speechSynthesis();
    const QList<VoiceDescription> installed = service.installedVoices();
    if (installed.isEmpty()) {
        return {};
    }
    if (!synthesisVoice.isEmpty() && synthesisVoice.compare(u"NULL", Qt::CaseInsensitive) != 0) {
        for (const Voice &voice : voices()) {
            if (voice.name.compare(synthesisVoice, Qt::CaseInsensitive) == 0
                || voice.identifier == synthesisVoice) {
                return voice.identifier;
            }
        }
    }
    const QString userDefault = service.defaultVoice();
    const bool userSelected = hasSelectedVoice(service);
    const QString wanted = Locale::componentsFromLocaleIdentifier(QString(language).replace(u'-', u'_'))
                               .languageCode.toLower();
    if (wanted.isEmpty() || language.compare(u"NULL", Qt::CaseInsensitive) == 0) {
        return userDefault;
    }
    if (const auto chosen = service.voice(userDefault);
        userSelected && chosen && languageOf(*chosen) == wanted) {
        return userDefault;
    }
    QStringList ofLanguage;
    QStringList ofGender;
    const QString gender = voiceType.toLower().remove(QRegularExpression(QStringLiteral("[0-9]+$")));
    for (const auto &voice : installed) {
        if (languageOf(voice) != wanted) {
            continue;
        }
        ofLanguage.append(voice.identifier);
        if (!gender.isEmpty() && genderOf(voice).startsWith(gender)) {
            ofGender.append(voice.identifier);
        }
    }
    if (ofLanguage.isEmpty()) {
        return userDefault;
    }
    return service.preferredVoiceForLocale(
        ofGender.isEmpty() ? ofLanguage : ofGender, QString(language).replace(u'-', u'_'));
}

} // namespace SdCadenza
