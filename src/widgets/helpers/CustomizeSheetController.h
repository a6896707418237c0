// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_CUSTOMIZESHEETCONTROLLER_H
#define CADENZA_PLATFORM_CUSTOMIZESHEETCONTROLLER_H

#include "cadenza_export.h"

#include <QObject>
#include <QSet>

#include <memory>

class QDialog;
class QTableView;

namespace Cadenza {

class CustomizeSheetControllerPrivate;

/**
 * What the customise sheets share: a window-modal dialog with a searchable table of grouped item rows
 * (views only for the rows on screen), the progress polling while it is open, and the OK and Cancel
 * flow. OK stores the visibility the ticks stand for, asks before removing unticked items and then
 * starts the removals and downloads; Cancel forgets every change. The voices and the dictation
 * languages sheets say what their rows are.
 */
class CADENZA_EXPORT CustomizeSheetController : public QObject
{
    Q_OBJECT
public:
    ~CustomizeSheetController() override;

    [[nodiscard]] QDialog *window() const;
    [[nodiscard]] QTableView *tableView() const;
    /// The installed items the user unticked that OK may remove.
    [[nodiscard]] QSet<QString> markedForDeletionSet() const;
    /// Stops the progress polling and closes the sheet.
    void close();
    /// Whether the open sheet asks the installer for progress.
    [[nodiscard]] bool isDownloadStatusPolling() const;

    void searchFieldChanged();
    [[nodiscard]] int numberOfRowsInTableView() const;
    [[nodiscard]] bool shouldSelectRow(int row) const;

Q_SIGNALS:
    /// The sheet ended: accepted with OK (after any removal alert), or cancelled.
    void sheetEnded(bool accepted);

protected:
    explicit CustomizeSheetController(std::unique_ptr<CustomizeSheetControllerPrivate> dd, QObject *parent);

    /// OK and Cancel, for the subclasses' own names of them.
    void acceptSheet();
    void cancelSheet();

    const std::unique_ptr<CustomizeSheetControllerPrivate> d_ptr;

private:
    Q_DECLARE_PRIVATE(CustomizeSheetController)
};

} // namespace Cadenza

#endif
