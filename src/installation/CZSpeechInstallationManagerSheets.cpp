#include "CZSpeechInstallationManagerSheets.h"

#include "platform/Logging.h"

namespace Cadenza {

namespace {
CZSpeechInstallationManagerSheets::VoiceSheetPresenter &presenter()
{
    static CZSpeechInstallationManagerSheets::VoiceSheetPresenter present;
    return present;
}
} // namespace

void CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(
    QWidget *window, bool showIndividualVoiceQualities)
{
    if (presenter()) {
        presenter()(window, showIndividualVoiceQualities);
        return;
    }
    qCWarning(Platform::lcInstallation, "The customise voices sheet is not available");
}

void CZSpeechInstallationManagerSheets::setVoiceSheetPresenter(VoiceSheetPresenter present)
{
    presenter() = std::move(present);
}

} // namespace Cadenza
