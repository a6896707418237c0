// cadenza-settings: a small speech settings application hosting Cadenza's controls.
#include "SettingsWindow.h"

#include "customize-voices/CustomizeVoicesWindowController.h"
#include "installation/CZSpeechInstallationManagerSheets.h"
#include "platform/SpeechDispatcherModule.h"
#include "recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "recognition-languages/CZSRLanguagePopUpButton.h"
#include "voice-settings/VoiceSettingsAlertController.h"
#include "voice-settings/VoiceSettingsSheetController.h"

#include <QApplication>
#include <QCommandLineParser>
#include <QDialog>
#include <QDir>
#include <QTimer>

#include <cstdio>

namespace {
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
    sheet->cancelVoiceSelection();

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

int main(int argc, char *argv[])
{
    QApplication app(argc, argv);
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

    SettingsWindow window;
    if (parser.isSet(screenshots)) {
        return writeScreenshots(window, parser.value(screenshots));
    }
    window.show();
    return app.exec();
}
