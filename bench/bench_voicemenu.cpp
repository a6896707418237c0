// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The voice controls with many voices, in one run beside their floors:
//  - building the shared voice menu (and adopting it into a pop-up) beside filling a plain QComboBox
//    with the same titles sorted by the locale's collator;
//  - one keystroke in the customise sheet's search field, typing and erasing a name;
//  - the peak memory of a process showing the customise sheet, beside an empty Qt Widgets process.
// Usage: bench_voicemenu [COUNT...]   (default 1,000 and 10,000 voices in 40 languages)

#include "BenchTable.h"

#include "FakeMessagePortService.h"
#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/services/Services.h"
#include "core/voices/CZVoiceObject.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-popup/CZVoicePopUpButton_p.h"

#include <QApplication>
#include <QCollator>
#include <QComboBox>
#include <QDialog>
#include <QFile>
#include <QLineEdit>
#include <QProcess>

#include <cstring>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

/// @p count voices in 40 languages, all shown in the voice menus.
std::shared_ptr<Platform::FakeSpeechSynthesisService> makeVoices(int count, QStringList *titles = nullptr)
{
    auto speech = std::make_shared<Platform::FakeSpeechSynthesisService>();
    speech->setSpeechLanguageLocale(QStringLiteral("en_US"));
    QVariantMap visible;
    for (int i = 0; i < count; ++i) {
        const QString identifier = QStringLiteral("com.vendra.bench.voice%1").arg(i, 5, 10, QLatin1Char('0'));
        const QString name = QStringLiteral("Voice %1").arg(i);
        speech->addVoice(
            QVariantMap {{QStringLiteral("VoiceIdentifier"), identifier}, {QStringLiteral("VoiceName"), name},
                {QStringLiteral("VoiceLocaleIdentifier"), QString::fromLatin1(Locales[i % 40])},
                {QStringLiteral("VoiceGender"),
                    i % 3 ? QStringLiteral("VoiceGenderFemale") : QStringLiteral("VoiceGenderMale")}});
        visible.insert(identifier, 1);
        if (titles) {
            titles->append(name);
        }
    }
    Platform::Services::setSpeechSynthesis(speech);
    Platform::Services::setPreferences(std::make_shared<Platform::MemoryPreferencesStore>());
    CZVoiceObject::setVisibleVoicesTable(visible);
    return speech;
}

void measureMenu(int count)
{
    QStringList titles;
    auto speech = makeVoices(count, &titles);
    QCollator collator {QLocale(QStringLiteral("en_US"))};
    collator.setNumericMode(true);
    collator.setCaseSensitivity(Qt::CaseInsensitive);
    const std::vector<double> floor = samplesOf(5, [&] {
        QStringList sorted = titles;
        std::sort(sorted.begin(), sorted.end(),
            [&](const QString &a, const QString &b) { return collator.compare(a, b) < 0; });
        QComboBox plain;
        plain.addItems(sorted);
    });
    CZVoicePopUpButton popUp;
    popUp.buildPopUpButtonWithSelectVoiceIdentifier(QStringLiteral("com.vendra.bench.voice00000"));
    // Emptying the shared menu makes the pop-up rebuild it and adopt the new one.
    const std::vector<double> build
        = samplesOf(5, [&] { CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdate(); });
    const std::string n = " (" + std::to_string(count) + " voices, 40 languages)";
    printTable(("Shared voice menu" + n).c_str(),
        {{"build the shared menu and adopt it, ms", median(build) * 1e3, "ms",
            "QComboBox::addItems, collator-sorted", median(floor) * 1e3}});
    VoicePopUpPrivate::resetProcessState();
}

void measureFilter(int count)
{
    makeVoices(count);
    CustomizeVoicesWindowController sheet;
    QWidget client;
    client.resize(800, 600);
    client.show();
    sheet.showSheetForWindow(&client, false);
    QCoreApplication::processEvents();
    QLineEdit *search = sheet.window()->findChild<QLineEdit *>(QStringLiteral("searchField"));
    const QString typed = QStringLiteral("voice 4321");
    std::vector<double> typing;
    std::vector<double> erasing;
    for (int round = 0; round < 3; ++round) {
        for (qsizetype length = 1; length <= typed.size(); ++length) {
            typing.push_back(secondsOf([&] {
                search->setText(typed.left(length));
                QCoreApplication::processEvents(); // the row views of the visible rows
            }));
        }
        for (qsizetype length = typed.size() - 1; length >= 0; --length) {
            erasing.push_back(secondsOf([&] {
                search->setText(typed.left(length));
                QCoreApplication::processEvents();
            }));
        }
    }
    std::sort(typing.begin(), typing.end());
    std::sort(erasing.begin(), erasing.end());
    const double perVoice = erasing.back() / count;
    const std::string n = " (" + std::to_string(count) + " voices)";
    const double goal = count <= 1000 ? 16.0 : 100.0;
    printTable(("Customise sheet, one search keystroke" + n).c_str(),
        {{"typing, median, ms", median(typing) * 1e3, "ms", "goal", goal},
            {"typing, slowest, ms", typing.back() * 1e3, "ms", "goal", goal},
            {"erasing, median, ms", median(erasing) * 1e3, "ms", "goal", goal},
            {"erasing, slowest (all voices back), ms", erasing.back() * 1e3, "ms", "goal", goal},
            {"slowest keystroke per voice, us", perVoice * 1e6, "us", "-", 0}});
    sheet.cancelVoiceSelection();
}

long peakKilobytes()
{
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly)) {
        return -1;
    }
    for (const QByteArray &line : status.readAll().split('\n')) {
        if (line.startsWith("VmHWM:")) {
            return line.mid(6).trimmed().split(' ').first().toLong();
        }
    }
    return -1;
}

// Runs this program again to show the sheet (or an empty window) and returns its peak memory in kB.
long peakOfChild(const QString &mode, int count)
{
    QProcess child;
    child.start(QCoreApplication::applicationFilePath(), {mode, QString::number(count)});
    if (!child.waitForFinished(120000) || child.exitCode() != 0) {
        return -1;
    }
    return child.readAllStandardOutput().trimmed().toLong();
}

} // namespace

int main(int argc, char *argv[])
{
    qputenv("QT_QPA_PLATFORM", QByteArrayLiteral("offscreen"));
    QApplication app(argc, argv);
    Platform::Services::setUserLocale(std::make_shared<Platform::FakeUserLocaleService>());
    Platform::Services::setNotifications(std::make_shared<Platform::InProcessNotificationCenter>());
    Platform::Services::setMessagePorts(std::make_shared<Platform::FakeMessagePortService>());

    if (argc == 3 && std::strcmp(argv[1], "--show-sheet") == 0) {
        makeVoices(std::atoi(argv[2]));
        auto *sheet = new CustomizeVoicesWindowController;
        QWidget client;
        client.resize(800, 600);
        client.show();
        sheet->showSheetForWindow(&client, false);
        QCoreApplication::processEvents();
        std::printf("%ld\n", peakKilobytes());
        return 0;
    }
    if (argc == 3 && std::strcmp(argv[1], "--show-empty") == 0) {
        QWidget window;
        window.resize(800, 600);
        window.show();
        QCoreApplication::processEvents();
        std::printf("%ld\n", peakKilobytes());
        return 0;
    }

    for (const int count : countsFromArguments(argc, argv)) {
        measureMenu(count);
        measureFilter(count);
    }
    const int largest = countsFromArguments(argc, argv).back();
    const long sheet = peakOfChild(QStringLiteral("--show-sheet"), largest);
    const long empty = peakOfChild(QStringLiteral("--show-empty"), 0);
    printTable(("Peak memory (" + std::to_string(largest) + " voices)").c_str(),
        {{"process showing the customise sheet, MB", sheet / 1024.0, "MB", "empty Qt Widgets window",
            empty / 1024.0}});
    return 0;
}
