// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_CUSTOMIZESHEETCONTROLLER_P_H
#define CADENZA_PLATFORM_CUSTOMIZESHEETCONTROLLER_P_H

// Not public API: the state and the steps of a customise sheet, for its subclasses and tests.

#include "cadenza_export.h"
#include "core/installation/SelectionChanges.h"

#include <QPointer>
#include <QRecursiveMutex>
#include <QSet>
#include <QString>
#include <QVariantMap>

#include <functional>

class QDialog;
class QLabel;
class QLineEdit;
class QPushButton;
class QTableView;
class QTimer;

namespace Cadenza {

class CustomizeSheetController;
namespace Platform {
class GroupedRowsModel;
class VisibleRowViews;
} // namespace Platform

class CADENZA_EXPORT CustomizeSheetControllerPrivate
{
public:
    /// The widgets the sheet's form made.
    struct Form
    {
        QTableView *table = nullptr;
        QPushButton *okButton = nullptr;
        QPushButton *cancelButton = nullptr;
        QLineEdit *searchField = nullptr;
        QLabel *selectedDownloadSizeTextField = nullptr;
        QLabel *noResultsFoundTextField = nullptr;
        QLabel *explanationLabel = nullptr;
    };
    /// Localisation keys of the sheet's own texts.
    struct FormTexts
    {
        QString title;
        QString explanation;
        QString table;
        /// The title of the alert that asks before removing unticked items.
        QString removalAlertTitle;
    };
    /// What OK decided, and how to carry it out once the user agreed.
    struct Decision
    {
        SelectionChanges changes;
        /// Starts the removals; run only when the user chose Delete.
        std::function<void()> remove;
        /// Runs after the sheet closed: starts the downloads and tells the other processes.
        std::function<void()> commit;
    };

    explicit CustomizeSheetControllerPrivate(CustomizeSheetController *q);
    virtual ~CustomizeSheetControllerPrivate();

    /// Takes over the form set up on window: texts, model, row views and every connection.
    void setUpForm(
        const Form &form, const FormTexts &texts, Platform::GroupedRowsModel *model, int rowHeight);

    /// Opens the sheet on @p parentWindow (null: application-modal) afresh; polls progress when @p poll.
    void present(QWidget *parentWindow, bool poll);
    void close();
    void stopObservingInstallations();
    void endSheet(bool accepted);
    void accept();
    void cancel();
    /// Brings the displayed rows up to date with the installer's active installations.
    void _updateRowDownloadStatus();

    /// The status line of an item row: waiting, downloading (with its percentage) or, for a ticked
    /// item that is not installed, required; empty otherwise.
    [[nodiscard]] static QString rowStatusText(
        qint64 downloadStatus, double percentComplete, bool isSelected);
    /// Sets the "n MB selected" line to @p total bytes (empty for none).
    void showSelectedDownloadSize(quint64 total);
    [[nodiscard]] QWidget *existingViewForRow(int row) const;
    /// Shows or hides "no results" after filtering, and says it to a screen reader on the search field.
    void showWhetherAnythingMatched(bool anything);

    // What a sheet says about its rows.
    [[nodiscard]] virtual int rowCount() const = 0;
    [[nodiscard]] virtual bool isGroupRow(int row) const = 0;
    /// The view of item row @p row, @p spare (or a new view) filled in; null for headings.
    [[nodiscard]] virtual QWidget *viewForRow(int row, QWidget *spare) = 0;
    /// Rebuilds the list of items (on showing and when an installation finished).
    virtual void rebuild() = 0;
    virtual void updateDisplayUsingFilterString(const QString &filter) = 0;
    /// The installer's records of the active installations of the sheet's kind.
    [[nodiscard]] virtual QVariantList activeInstallations() const = 0;
    /// The displayed row an installation record is about; -1 for none.
    [[nodiscard]] virtual int rowOfInstallationRecord(const QVariantMap &record) = 0;
    /// Takes the status and progress of @p record into item row @p row and its view.
    virtual void showInstallationRecord(int row, const QVariantMap &record) = 0;
    virtual void selectionDidChange() = 0;
    /// Decides OK (under the lock) and stores the visibility.
    [[nodiscard]] virtual Decision decide() = 0;
    /// Stops what the sheet is doing (a sample playing) before it ends.
    virtual void stopActivity() { }
    /// Runs once the items are rebuilt, before the sheet is shown.
    virtual void willPresent() { }
    /// Runs just before an accepted sheet closes.
    virtual void willCommit() { }
    /// Runs once the sheet is on screen.
    virtual void didPresent() { }

    CustomizeSheetController *const q_ptr;
    QDialog *window;
    Form form;
    FormTexts formTexts;
    Platform::GroupedRowsModel *model = nullptr;
    Platform::VisibleRowViews *rowViews = nullptr;
    QPointer<QTimer> downloadStatusUpdateTimer;
    QMetaObject::Connection installationObservation;
    QSet<QString> markedForDeletionSet;
    mutable QRecursiveMutex lock;

private:
    void commit(const std::function<void()> &afterClosing);
    Q_DECLARE_PUBLIC(CustomizeSheetController)
};

} // namespace Cadenza

#endif
