// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// cadenza-settings: a small speech settings application hosting Cadenza's controls.
#include "SettingsWindow.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/services/SpeechDispatcherModule.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"
#include "widgets/voice-settings/VoiceSettingsAlertController.h"
#include "widgets/voice-settings/VoiceSettingsSheetController.h"

#include <QAccessibleWidget>
#include <QApplication>
#include <QCommandLineParser>
#include <QDeadlineTimer>
#include <QDialog>
#include <QDir>
#include <QEventLoop>
#include <QPushButton>
#include <QTableView>
#include <QTimer>

#include <cstdio>
#include <functional>
#include <memory>

namespace {

void wait(int milliseconds)
{
    QEventLoop loop;
    QTimer::singleShot(milliseconds, &loop, &QEventLoop::quit);
    loop.exec();
}

// Ticks a downloadable voice in the customise voices sheet, pictures the sheet with its size and
// presses OK, which asks the installer daemon for it; then waits until its bytes are arriving. False
// when no daemon can be reached (the sheet is cancelled) or nothing is downloading within 15 s.
bool tickAndDownload(Cadenza::CustomizeVoicesWindowController *sheet, const std::function<void()> &picture)
{
    using namespace Cadenza::InstallerProtocol;
    auto *manager = Cadenza::CZSpeechInstallationManager::sharedManager();
    const QList<Cadenza::VoiceTableRowPtr> rows = sheet->currentlyDisplayedVoiceRows();
    // Preferably a voice offered in two sizes, so the picture shows the size choice.
    int chosen = -1;
    for (int row = 0; row < rows.size(); ++row) {
        const auto voice = rows.at(row)->voiceObject();
        if (!voice || voice->downloadStatus() != NotInstalledStatus) {
            continue;
        }
        if (voice->isDownloadable()
            && !std::static_pointer_cast<Cadenza::DownloadableVoice>(voice)
                    ->fullSizeBundleIdentifier()
                    .isEmpty()) {
            chosen = row;
            break;
        }
        if (chosen < 0) {
            chosen = row;
        }
    }
    if (chosen < 0 || !Cadenza::CZSpeechInstallationManagerPrivate::get(manager)->_serverIsReachable()) {
        sheet->cancelVoiceSelection();
        return false;
    }
    sheet->voiceSelectionTableView()->scrollTo(sheet->voiceSelectionTableView()->model()->index(chosen, 0));
    wait(200);
    Cadenza::VoiceTableCellView *view = sheet->existingViewForRow(chosen);
    auto *ok = sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"));
    if (!view || !ok) {
        sheet->cancelVoiceSelection();
        return false;
    }
    view->activeCheckbox()->click();
    wait(200);
    picture();
    ok->click();
    QDeadlineTimer deadline(15000);
    while (!deadline.hasExpired()) {
        for (const QVariant &value : manager->activeInstallations()) {
            const QVariantMap record = value.toMap();
            if (record.value(ItemSoftwareUpdateStateKey).toLongLong() == DownloadingState
                && record.value(ItemDownloadByteCountKey).toULongLong() > 0) {
                return true;
            }
        }
        wait(100);
    }
    return false;
}

// Renders the windows the way they look now and writes them as PNG files into @p folder.
int writeScreenshots(SettingsWindow &window, const QString &folder)
{
    if (!QDir().mkpath(folder)) {
        std::fprintf(stderr, "cadenza-settings: cannot create the folder %s\n", qPrintable(folder));
        return 1;
    }
    int failures = 0;
    auto save = [&](QWidget *widget, const char *name) {
        QCoreApplication::processEvents();
        const QString path = QDir(folder).filePath(QLatin1String(name));
        if (!widget->grab().save(path)) {
            std::fprintf(stderr, "cadenza-settings: cannot write %s\n", qPrintable(path));
            ++failures;
            return;
        }
        std::printf("%s\n", qPrintable(path));
    };
    window.resize(560, 360);
    window.show();
    save(&window, "main-window.png");

    window.openVoiceSettingsWindow();
    QDialog *dialog = Cadenza::VoiceSettingsWindowController::defaultVoiceSettingsAlertController()->window();
    save(dialog, "voice-settings-window.png");
    Cadenza::VoiceSettingsWindowController::defaultVoiceSettingsAlertController()->cancelVoiceSettings();

    window.openVoiceSettingsSheet();
    dialog = Cadenza::VoiceSettingsWindowController::defaultVoiceSettingsSheetController()->window();
    save(dialog, "voice-settings-sheet.png");
    Cadenza::VoiceSettingsWindowController::defaultVoiceSettingsSheetController()->cancelVoiceSettings();

    Cadenza::CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(&window, false);
    Cadenza::CustomizeVoicesWindowController *sheet
        = Cadenza::CZSpeechInstallationManagerSheets::voiceSelectionWindowController();
    sheet->window()->resize(680, 520);
    QCoreApplication::processEvents();
    save(sheet->window(), "customize-voices.png");

    // A voice ticked for download, with its size; OK asks the installer daemon for it.
    if (tickAndDownload(sheet, [&] { save(sheet->window(), "customize-voices-ticked.png"); })) {
        wait(1500); // the pop-ups refresh their status line every half second
        save(&window, "main-window-downloading.png");
        Cadenza::CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(&window, false);
        sheet->window()->resize(680, 520);
        wait(500);
        save(sheet->window(), "customize-voices-downloading.png");
        sheet->cancelVoiceSelection();
    } else {
        std::fprintf(stderr,
            "cadenza-settings: no download could be started (is quillond running?); "
            "no screenshots of a download in progress\n");
    }

    Cadenza::CZSpeechInstallationManagerSheets::showSRLanguagesSelectionSheetForWindow(&window,
        QStringList {QStringLiteral("en_US"), QStringLiteral("de_DE"), QStringLiteral("fr_FR")},
        window.languagePopUp()->previouslyChosenLocaleIdentifier(), true);
    Cadenza::CZCustomizeSRLanguagesWindowController *languages
        = Cadenza::CZSpeechInstallationManagerSheets::srLanguagesSelectionWindowController();
    languages->window()->resize(640, 420);
    QCoreApplication::processEvents();
    save(languages->window(), "customize-languages.png");
    languages->cancelSelection();
    return failures == 0 ? 0 : 1;
}
} // namespace

namespace {

/// Whether the command line asks only for what needs no window (help, the speech-dispatcher module),
/// which must work without a display too, e.g. from scripts on a server.
bool answersWithoutAWindow(int argc, char *argv[])
{
    for (int i = 1; i < argc; ++i) {
        const QByteArray argument(argv[i]);
        if (argument == "-h" || argument == "-?" || argument == "--help" || argument == "--help-all"
            || argument == "--install-speech-dispatcher-module"
            || argument == "--remove-speech-dispatcher-module") {
            return true;
        }
    }
    return false;
}

} // namespace

int main(int argc, char *argv[])
{
    const std::unique_ptr<QCoreApplication> application = answersWithoutAWindow(argc, argv)
        ? std::make_unique<QCoreApplication>(argc, argv)
        : std::make_unique<QApplication>(argc, argv);
    QCoreApplication &app = *application;
    QApplication::setApplicationName(QStringLiteral("cadenza-settings"));
    QApplication::setDesktopFileName(QStringLiteral("org.cadenza.Settings"));

    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral("Speech settings: the system voice, the voices to show "
                                                    "and download, and the voice settings dialog."));
    parser.addHelpOption();
    const QCommandLineOption screenshots(QStringLiteral("screenshots"),
        QStringLiteral("Write screenshots of every window into <folder> and exit."),
        QStringLiteral("folder"));
    parser.addOption(screenshots);
    const QCommandLineOption installModule(QStringLiteral("install-speech-dispatcher-module"),
        QStringLiteral(
            "Offer the Cadenza voices to other apps: install speech-dispatcher's module for this user "
            "(~/.local/libexec/speech-dispatcher-modules/sd_cadenza) and exit."));
    const QCommandLineOption removeModule(QStringLiteral("remove-speech-dispatcher-module"),
        QStringLiteral("Remove the module that --install-speech-dispatcher-module installed and exit; other "
                       "modules and speech-dispatcher's configuration stay as they are."));
    parser.addOption(installModule);
    parser.addOption(removeModule);
    parser.process(app);
    if (parser.isSet(installModule) || parser.isSet(removeModule)) {
        using Cadenza::Platform::SpeechDispatcherModule;
        QString error;
        const bool done = parser.isSet(installModule)
            ? SpeechDispatcherModule::installForUser(
                SpeechDispatcherModule::shippedModule(QCoreApplication::applicationDirPath()), &error)
            : SpeechDispatcherModule::removeForUser(&error);
        if (!done) {
            std::fprintf(stderr, "cadenza-settings: %s\n", qPrintable(error));
            return 1;
        }
        std::printf("%s %s\n", parser.isSet(installModule) ? "Installed" : "Removed",
            qPrintable(SpeechDispatcherModule::userModulePath()));
        return 0;
    }

    // The main window is a plain widget; screen readers should meet it as a window.
    QAccessible::installFactory([](const QString &, QObject *object) -> QAccessibleInterface * {
        auto *settings = qobject_cast<SettingsWindow *>(object);
        return settings ? new QAccessibleWidget(settings, QAccessible::Window) : nullptr;
    });
    SettingsWindow window;
    if (parser.isSet(screenshots)) {
        return writeScreenshots(window, parser.value(screenshots));
    }
    window.show();
    return app.exec();
}
