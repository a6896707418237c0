// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The voice-menu filter and voice search over 1,000 and 10,000 voices in 40 languages, beside
// sorting the same display names with the locale's collator, in the same run.

#include "BenchTable.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/services/Services.h"
#include "core/voices/CZVoiceObject.h"

#include <QCollator>
#include <QCoreApplication>
#include <QLocale>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

void measure(int count)
{
    auto speech = std::make_shared<Platform::FakeSpeechSynthesisService>();
    for (int i = 0; i < count; ++i) {
        const QString quality = i % 2 ? QStringLiteral(".premium") : QStringLiteral(".compact");
        speech->addVoice(QVariantMap {{QStringLiteral("VoiceIdentifier"),
                                          QStringLiteral("com.vendra.bench.voice%1%2")
                                              .arg(i / 2, 5, 10, QLatin1Char('0'))
                                              .arg(quality)},
            {QStringLiteral("VoiceName"),
                QStringLiteral("Voice %1 %2")
                    .arg(i / 2)
                    .arg(i % 2 ? QStringLiteral("Premium") : QStringLiteral("Compact"))},
            {QStringLiteral("VoiceLocaleIdentifier"), QString::fromLatin1(Locales[(i / 2) % 40])},
            {QStringLiteral("VoiceGender"),
                i % 3 ? QStringLiteral("VoiceGenderFemale") : QStringLiteral("VoiceGenderMale")}});
    }
    Platform::Services::setSpeechSynthesis(speech);
    const QStringList identifiers
        = speech->voiceIdentifiersInGroups({Platform::SpeechSynthesisService::DefaultVoiceGroup,
            Platform::SpeechSynthesisService::CompactVoiceGroup});
    QStringList names;
    for (const QString &identifier : identifiers) {
        names.append(speech->attributesForVoice(identifier).value(QStringLiteral("VoiceName")).toString());
    }
    QCollator collator {QLocale(QStringLiteral("en_US"))};
    collator.setNumericMode(true);
    const double sortFloor = median(samplesOf(5, [&] {
        QStringList copy = names;
        std::sort(copy.begin(), copy.end(),
            [&](const QString &a, const QString &b) { return collator.compare(a, b) < 0; });
    }));
    const double filterAll = median(samplesOf(
        5, [] { (void)CZVoiceObject::visibleVoicesForLocaleIdentifier(QStringLiteral("en_US"), {}, true); }));
    const double filterMainstream = median(samplesOf(5,
        [] { (void)CZVoiceObject::visibleVoicesForLocaleIdentifier(QStringLiteral("en_US"), {}, false); }));
    QList<CZVoiceObjectPtr> voices;
    const auto freshVoices = [&] {
        voices.clear();
        for (const QString &identifier : identifiers) {
            voices.append(CZVoiceObject::initWithVoiceIdentifier(identifier));
        }
    };
    // One keystroke of a search field: every voice tested against the words typed so far. The first
    // keystroke also makes each voice's names; later ones find them made. A first keystroke happens
    // once per set of voice objects, so each sample has fresh ones.
    int found = 0;
    std::vector<double> firstSearches;
    for (int i = 0; i < 5; ++i) {
        freshVoices();
        firstSearches.push_back(secondsOf([&] {
            for (const auto &voice : voices) {
                found += voice->matchesSearchString(QStringLiteral("fem swed")) ? 1 : 0;
            }
        }));
    }
    const double firstSearch = median(firstSearches);
    const double search = median(samplesOf(5, [&] {
        found = 0;
        for (const auto &voice : voices) {
            found += voice->matchesSearchString(QStringLiteral("fem swed")) ? 1 : 0;
        }
    }));
    const std::string n = " (" + std::to_string(count) + " voices)";
    printTable(("Voice filter and search" + n).c_str(),
        {{"visibleVoicesForLocale..., all voices, ms", filterAll * 1e3, "ms", "collator sort of the names",
             sortFloor * 1e3},
            {"visibleVoicesForLocale..., mainstream, ms", filterMainstream * 1e3, "ms",
                "collator sort of the names", sortFloor * 1e3},
            {"matchesSearchString, first keystroke, ms", firstSearch * 1e3, "ms",
                "collator sort of the names", sortFloor * 1e3},
            {"matchesSearchString, next keystrokes, ms", search * 1e3, "ms", "collator sort of the names",
                sortFloor * 1e3}});
    std::printf("(search found %d voices)\n", found);
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
