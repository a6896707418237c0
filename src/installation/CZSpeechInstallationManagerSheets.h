#ifndef CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGERSHEETS_H
#define CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGERSHEETS_H

#include "cadenza_export.h"

#include <functional>

class QWidget;

namespace Cadenza {

class CustomizeVoicesWindowController;

/**
 * The installation manager's sheets: the customise voices sheet, made once per process and reused.
 * The manager itself lives in the core library, which has no widgets; its sheets live here.
 */
class CADENZA_EXPORT CZSpeechInstallationManagerSheets
{
public:
    using VoiceSheetPresenter = std::function<void(QWidget *window, bool showIndividualVoiceQualities)>;

    /// The customise voices sheet's controller, made and loaded on first use.
    [[nodiscard]] static CustomizeVoicesWindowController *voiceSelectionWindowController();
    /// Shows the customise voices sheet on @p window.
    static void showVoiceSelectionSheetForWindow(QWidget *window, bool showIndividualVoiceQualities);
    /// Routes showVoiceSelectionSheetForWindow() to @p presenter (tests); empty restores the sheet.
    static void setVoiceSheetPresenter(VoiceSheetPresenter presenter);
};

} // namespace Cadenza

#endif
