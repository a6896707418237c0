// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Arranging voice rows (the customise sheet's and the voice menu's lists) for 1,000 and 10,000 voices
// in 40 languages, beside sorting the same display names with the locale's collator, in one run.

#include "BenchTable.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/rows/VoiceTableRow.h"
#include "core/services/Services.h"

#include <QCollator>
#include <QCoreApplication>
#include <QLocale>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

void measure(int count)
{
    auto speech = std::make_shared<Platform::FakeSpeechSynthesisService>();
    speech->setSpeechLanguageLocale(QStringLiteral("en_US"));
    for (int i = 0; i < count; ++i) {
        speech->addVoice(
            QVariantMap {{QStringLiteral("VoiceIdentifier"),
                             QStringLiteral("com.vendra.bench.voice%1").arg(i, 5, 10, QLatin1Char('0'))},
                {QStringLiteral("VoiceName"), QStringLiteral("Voice %1").arg(i)},
                {QStringLiteral("VoiceLocaleIdentifier"), QString::fromLatin1(Locales[i % 40])},
                {QStringLiteral("VoiceGender"),
                    i % 3 ? QStringLiteral("VoiceGenderFemale") : QStringLiteral("VoiceGenderMale")}});
    }
    Platform::Services::setSpeechSynthesis(speech);
    QList<CZVoiceObjectPtr> voices;
    QStringList names;
    for (const auto &voice : speech->installedVoices()) {
        voices.append(CZVoiceObject::initWithVoiceIdentifier(voice.identifier));
        names.append(voice.attributes.value(QStringLiteral("VoiceName")).toString());
    }
    QCollator collator {QLocale(QStringLiteral("en_US"))};
    collator.setNumericMode(true);
    const double floor = median(samplesOf(5, [&] {
        QStringList copy = names;
        std::sort(copy.begin(), copy.end(),
            [&](const QString &a, const QString &b) { return collator.compare(a, b) < 0; });
    }));
    const double sheet = median(samplesOf(
        5, [&] { (void)VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, false, true, true); }));
    const double menu = median(samplesOf(
        5, [&] { (void)VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, true, false, false); }));
    const std::string n = " (" + std::to_string(count) + " voices, 40 languages)";
    printTable(("Voice row arrangement" + n).c_str(),
        {{"arrangedRows..., the sheet's flags, ms", sheet * 1e3, "ms", "collator sort of the names",
             floor * 1e3},
            {"arrangedRows..., the menu's flags, ms", menu * 1e3, "ms", "collator sort of the names",
                floor * 1e3}});
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    Platform::Services::setUserLocale(std::make_shared<Platform::FakeUserLocaleService>());
    Platform::Services::setPreferences(std::make_shared<Platform::MemoryPreferencesStore>());
    Platform::Services::setNotifications(std::make_shared<Platform::InProcessNotificationCenter>());
    for (const int count : countsFromArguments(argc, argv)) {
        measure(count);
    }
    return 0;
}
