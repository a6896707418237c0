// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_H
#define CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/recognition-items/CZSRLanguageRow.h"
#include "widgets/helpers/CustomizeSheetController.h"

#include <QStringList>

#include <optional>

namespace Cadenza {

class CZCustomizeSRLanguagesWindowControllerPrivate;
class CZSRLanguageTableCellView;

/**
 * The customise recognition languages sheet: a searchable table of dictation languages grouped by
 * language, in which the user ticks the languages the pop-up lists and, when downloads are allowed,
 * ticks languages to fetch (choosing between two sizes) and unticks installed ones to remove. OK saves
 * the ticks as visibility values, starts the downloads and, after asking, the removals (telling
 * dictation to stop listening first). The required locale is always shown and never removed.
 *
 * One controller per process, made by CZSpeechInstallationManagerSheets.
 */
class CADENZA_EXPORT CZCustomizeSRLanguagesWindowController : public CustomizeSheetController
{
    Q_OBJECT
public:
    explicit CZCustomizeSRLanguagesWindowController(QObject *parent = nullptr);
    ~CZCustomizeSRLanguagesWindowController() override;

    void showSheetForWindow(QWidget *window,
        const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
        const QString &requiredLocaleIdentifier, bool supportDownloads);

    void acceptSelection();
    void cancelSelection();

    /// The row view of language row @p row: @p spare (or a new view) filled in; null for headings.
    [[nodiscard]] CZSRLanguageTableCellView *viewForRow(int row, CZSRLanguageTableCellView *spare = nullptr);
    [[nodiscard]] CZSRLanguageTableCellView *existingViewForRow(int row) const;

    [[nodiscard]] QList<CZSRLanguageRowPtr> currentlyDisplayedRows();
    [[nodiscard]] QTableView *selectionTableView() const { return tableView(); }

private:
    Q_DECLARE_PRIVATE(CZCustomizeSRLanguagesWindowController)
};

} // namespace Cadenza

#endif
