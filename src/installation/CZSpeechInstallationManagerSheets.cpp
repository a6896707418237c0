#include "CZSpeechInstallationManagerSheets.h"

#include "customize-voices/CustomizeVoicesWindowController.h"
#include "recognition-languages/CZCustomizeSRLanguagesWindowController.h"

#include <QDialog>

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
} // namespace

CustomizeVoicesWindowController *CZSpeechInstallationManagerSheets::voiceSelectionWindowController()
{
    // Made once and kept for the life of the process; never deleted after the application object.
    static CustomizeVoicesWindowController *controller = [] {
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
    srLanguagesSelectionWindowController()->showSheetForWindow(
        window, networkSupportedLocaleIdentifiers, requiredLocaleIdentifier, supportDownloads);
}

void CZSpeechInstallationManagerSheets::setSRLanguageSheetPresenter(SRLanguageSheetPresenter presenter)
{
    languagePresenter() = std::move(presenter);
}

} // namespace Cadenza
