// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_H
#define CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_H

#include "cadenza_export.h"
#include "core/rows/VoiceTableRow.h"
#include "widgets/helpers/CustomizeSheetController.h"

namespace Cadenza {

class CustomizeVoicesWindowControllerPrivate;
class VoiceTableCellView;

/**
 * The customise voices sheet: a searchable table of every installed and downloadable voice, grouped by
 * language, country and gender. The user ticks the voices the voice menus show, ticks downloads and
 * upgrades, unticks removable voices to delete them, picks between a voice's two download sizes and
 * plays a sample. OK writes the visibility table, removes what was unticked (after asking), starts the
 * downloads and tells every process that the voice list changed; Cancel forgets it all.
 *
 * There is one controller per process, made by CZSpeechInstallationManagerSheets; each showing starts
 * afresh. Only the visible rows of the table have row views (VoiceTableCellView), so the sheet stays
 * quick with tens of thousands of voices.
 */
class CADENZA_EXPORT CustomizeVoicesWindowController : public CustomizeSheetController
{
    Q_OBJECT
public:
    explicit CustomizeVoicesWindowController(QObject *parent = nullptr);
    ~CustomizeVoicesWindowController() override;

    /// Opens the sheet on @p window; @p showIndividualVoiceQualities lists every quality of a voice.
    void showSheetForWindow(QWidget *window, bool showIndividualVoiceQualities);

    void acceptVoiceSelection();
    void cancelVoiceSelection();
    void startStopPlayingSelection();

    [[nodiscard]] bool isGroupRow(int row) const;
    /// The row view of voice row @p row: @p spare (or a new view) filled in; null for headings.
    [[nodiscard]] VoiceTableCellView *viewForRow(int row, VoiceTableCellView *spare = nullptr);
    /// The row view the table holds for @p row now; null when it has none.
    [[nodiscard]] VoiceTableCellView *existingViewForRow(int row) const;
    void tableViewSelectionDidChange();
    void soundDidFinishPlaying();
    void speechSynthesizerDidFinishSpeaking();

    [[nodiscard]] QList<VoiceTableRowPtr> currentlyDisplayedVoiceRows();
    [[nodiscard]] QTableView *voiceSelectionTableView() const { return tableView(); }
    /// The resource path of a downloadable voice's recorded sample.
    [[nodiscard]] static QString samplePathForVoiceIdentifier(const QString &voiceIdentifier);

private:
    Q_DECLARE_PRIVATE(CustomizeVoicesWindowController)
};

} // namespace Cadenza

#endif
