// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGERSHEETS_H
#define CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGERSHEETS_H

#include "cadenza_export.h"

#include <QStringList>

#include <functional>
#include <optional>

class QWidget;

namespace Cadenza {

class CustomizeVoicesWindowController;
class CZCustomizeSRLanguagesWindowController;

/**
 * The installation manager's sheets: the customise voices sheet and the customise recognition
 * languages sheet, each made once per process and reused.
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

    using SRLanguageSheetPresenter = std::function<void(QWidget *window,
        const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
        const QString &requiredLocaleIdentifier, bool supportDownloads)>;
    /// The customise recognition languages sheet's controller, made and loaded on first use.
    [[nodiscard]] static CZCustomizeSRLanguagesWindowController *srLanguagesSelectionWindowController();
    /// Shows the customise recognition languages sheet on @p window.
    static void showSRLanguagesSelectionSheetForWindow(QWidget *window,
        const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
        const QString &requiredLocaleIdentifier, bool supportDownloads);
    /// Routes showSRLanguagesSelectionSheetForWindow() to @p presenter (tests); empty restores the sheet.
    static void setSRLanguageSheetPresenter(SRLanguageSheetPresenter presenter);
};

} // namespace Cadenza

#endif
