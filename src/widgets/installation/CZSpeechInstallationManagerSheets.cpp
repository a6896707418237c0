// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSpeechInstallationManagerSheets.h"

#include "core/installation/CZSpeechInstallationManager.h"

#include "core/locale/LocalizationTable.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/helpers/Alert.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"

#include <QApplication>
#include <QDialog>
#include <QLocale>
#include <QPointer>
#include <QTimer>

namespace Cadenza {

namespace {
CZSpeechInstallationManagerSheets::VoiceSheetPresenter &presenter()
{
    static CZSpeechInstallationManagerSheets::VoiceSheetPresenter present;
    return present;
}
CZSpeechInstallationManagerSheets::SRLanguageSheetPresenter &languagePresenter()
{
    static CZSpeechInstallationManagerSheets::SRLanguageSheetPresenter present;
    return present;
}
// The mode of the requests the download policy makes on its own.
constexpr qint64 AutomaticInteractionMode = 1;

// The window an alert about the sheets' requests belongs on: the one the sheet was shown on.
QPointer<QWidget> &alertWindow()
{
    static QPointer<QWidget> window;
    return window;
}

// The sheets send their requests when OK closes them; if the daemon cannot be reached, nothing would
// ever happen, so the user is told, once for all the items of one OK.
void tellWhenRequestsCannotBeSent()
{
    static bool connected = false;
    if (std::exchange(connected, true)) {
        return;
    }
    auto unsent = std::make_shared<QStringList>();
    QObject::connect(CZSpeechInstallationManager::sharedManager(),
        &CZSpeechInstallationManager::installationRequestFailed, qApp,
        [unsent](const QString &, const QString &itemName, qint64 userInteractionMode) {
            if (userInteractionMode == AutomaticInteractionMode) {
                return; // a background fetch the user did not ask for: nothing to tell
            }
            unsent->append(itemName);
            if (unsent->size() > 1) {
                return; // the alert is on its way
            }
            QTimer::singleShot(0, qApp, [unsent] {
                const auto &table = Platform::LocalizationTable::shared();
                Platform::AlertRequest alert;
                alert.title = table.text(QStringLiteral("InstallerUnreachableAlertTitleText"));
                alert.message = table.format(QStringLiteral("InstallerUnreachableAlertMessageText"),
                    {QLocale().createSeparatedList(*unsent)});
                alert.buttons = {table.text(QStringLiteral("OK"))};
                unsent->clear();
                QWidget *window = alertWindow() ? alertWindow()->window() : QApplication::activeWindow();
                if (window) {
                    Platform::Alert::beginSheet(alert, window, [](int) {});
                } else {
                    (void)Platform::Alert::runModal(alert);
                }
            });
        });
}

} // namespace

CustomizeVoicesWindowController *CZSpeechInstallationManagerSheets::voiceSelectionWindowController()
{
    // Made once and kept for the life of the process; never deleted after the application object.
    static CustomizeVoicesWindowController *controller = [] {
        tellWhenRequestsCannotBeSent();
        auto *made = new CustomizeVoicesWindowController;
        made->window()->ensurePolished();
        return made;
    }();
    return controller;
}

void CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(
    QWidget *window, bool showIndividualVoiceQualities)
{
    if (presenter()) {
        presenter()(window, showIndividualVoiceQualities);
        return;
    }
    alertWindow() = window;
    voiceSelectionWindowController()->showSheetForWindow(window, showIndividualVoiceQualities);
}

void CZSpeechInstallationManagerSheets::setVoiceSheetPresenter(VoiceSheetPresenter present)
{
    presenter() = std::move(present);
}

CZCustomizeSRLanguagesWindowController *
CZSpeechInstallationManagerSheets::srLanguagesSelectionWindowController()
{
    static CZCustomizeSRLanguagesWindowController *controller = [] {
        tellWhenRequestsCannotBeSent();
        auto *made = new CZCustomizeSRLanguagesWindowController;
        made->window()->ensurePolished();
        return made;
    }();
    return controller;
}

void CZSpeechInstallationManagerSheets::showSRLanguagesSelectionSheetForWindow(QWidget *window,
    const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
    const QString &requiredLocaleIdentifier, bool supportDownloads)
{
    if (languagePresenter()) {
        languagePresenter()(
            window, networkSupportedLocaleIdentifiers, requiredLocaleIdentifier, supportDownloads);
        return;
    }
    alertWindow() = window;
    srLanguagesSelectionWindowController()->showSheetForWindow(
        window, networkSupportedLocaleIdentifiers, requiredLocaleIdentifier, supportDownloads);
}

void CZSpeechInstallationManagerSheets::setSRLanguageSheetPresenter(SRLanguageSheetPresenter presenter)
{
    languagePresenter() = std::move(presenter);
}

} // namespace Cadenza
