#ifndef CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_H
#define CADENZA_RECOGNITIONLANGUAGES_CZCUSTOMIZESRLANGUAGESWINDOWCONTROLLER_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/recognition-items/CZSRLanguageRow.h"

#include <QObject>
#include <QPointer>
#include <QRecursiveMutex>
#include <QSet>
#include <QStringList>

#include <optional>

class QComboBox;
class QDialog;
class QLabel;
class QLineEdit;
class QPushButton;
class QTableView;
class QTimer;

namespace Cadenza {

class CZSRLanguageRowCheckboxButton;
class CZSRLanguageTableCellView;
class SRLanguageSelectionModel;
namespace Platform {
class VisibleRowViews;
}

/**
 * The customise recognition languages sheet: a searchable table of dictation languages grouped by
 * language, in which the user ticks the languages the pop-up lists and, when downloads are allowed,
 * ticks languages to fetch (choosing between two sizes) and unticks installed ones to remove. OK saves
 * the ticks as visibility values, starts the downloads and, after asking, the removals (telling
 * dictation to stop listening first). The required locale is always shown and never removed.
 *
 * One controller per process, made by CZSpeechInstallationManagerSheets.
 */
class CADENZA_EXPORT CZCustomizeSRLanguagesWindowController : public QObject
{
    Q_OBJECT
public:
    explicit CZCustomizeSRLanguagesWindowController(QObject *parent = nullptr);
    ~CZCustomizeSRLanguagesWindowController() override;

    [[nodiscard]] QDialog *window() const { return m_window; }
    void showSheetForWindow(QWidget *window,
        const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
        const QString &requiredLocaleIdentifier, bool supportDownloads);
    void close();

    void acceptSelection();
    void cancelSelection();
    void searchFieldChanged();

    void _rebuildList();
    void _updateDisplayUsingFilterString(const QString &filter);
    void _updateButtonStatesOnlyIfDownloadRequired(bool onlyIfDownloadRequired);
    void _propagateCheckboxSelection(CZSRLanguageRowCheckboxButton *sender);
    void _propagateDownloadVariantSelection(QComboBox *sender, int index);
    void _updateRowDownloadStatus();
    void _setRowStatusFieldView(QLabel *statusField, QComboBox *variantPopUpButton,
        const CZSRLanguageItemPtr &speechItem, bool isSelected);

    [[nodiscard]] int numberOfRowsInTableView() const;
    [[nodiscard]] bool shouldSelectRow(int row) const;
    /// The row view of language row @p row: @p spare (or a new view) filled in; null for headings.
    [[nodiscard]] CZSRLanguageTableCellView *viewForRow(int row, CZSRLanguageTableCellView *spare = nullptr);
    [[nodiscard]] CZSRLanguageTableCellView *existingViewForRow(int row) const;

    [[nodiscard]] QList<CZSRLanguageItemPtr> allObjects() const { return m_allObjects; }
    [[nodiscard]] QList<CZSRLanguageRowPtr> currentlyDisplayedRows();
    [[nodiscard]] QSet<QString> markedForDeletionSet() const { return m_markedForDeletionSet; }
    [[nodiscard]] QTableView *selectionTableView() const { return m_selectionTableView; }
    [[nodiscard]] bool isDownloadStatusPolling() const;

Q_SIGNALS:
    /// The sheet ended: accepted with OK (after any removal alert), or cancelled.
    void sheetEnded(bool accepted);

private:
    [[nodiscard]] int displayedRowOfLocale(const QString &localeIdentifier) const;
    void finishAccepted(const QList<CZSRLanguageItemPtr> &toInstall);
    void endSheet(bool accepted);

    QDialog *m_window;
    QTableView *m_selectionTableView;
    QPushButton *m_okButton;
    QPushButton *m_cancelButton;
    QLineEdit *m_searchField;
    QLabel *m_selectedDownloadSizeTextField;
    QLabel *m_noResultsFoundTextField;
    SRLanguageSelectionModel *m_model;
    Platform::VisibleRowViews *m_rowViews;

    QList<CZSRLanguageItemPtr> m_allObjects;
    QList<CZSRLanguageRowPtr> m_currentlyDisplayedRows;
    std::optional<QStringList> m_networkBasedLocaleIdentifiers;
    QString m_requiredLocaleIdentifier;
    QPointer<QTimer> m_downloadStatusUpdateTimer;
    QSet<QString> m_markedForDeletionSet;
    bool m_supportDownloads = false;
    mutable QRecursiveMutex m_lock;
    QMetaObject::Connection m_installationObservation;
};

} // namespace Cadenza

#endif
