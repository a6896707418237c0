// cadenza-settings: a small speech settings application hosting Cadenza's controls.
#include "SettingsWindow.h"

#include "customize-voices/CustomizeVoicesWindowController.h"
#include "installation/CZSpeechInstallationManagerSheets.h"
#include "recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "recognition-languages/CZSRLanguagePopUpButton.h"
#include "voice-settings/VoiceSettingsAlertController.h"
#include "voice-settings/VoiceSettingsSheetController.h"

#include <QAccessibleWidget>
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
    parser.process(app);

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
