#ifndef CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_H
#define CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_H

#include "cadenza_export.h"
#include "core/rows/VoiceTableRow.h"

#include <QHash>
#include <QObject>
#include <QPointer>
#include <QRecursiveMutex>
#include <QSet>

#include <memory>

class QComboBox;
class QDialog;
class QLabel;
class QLineEdit;
class QPushButton;
class QTableView;
class QTimer;

namespace Cadenza {

class CZVoiceRowCheckboxButton;
class SpeechSynthesizer;
namespace Platform {
class SoundService;
class VisibleRowViews;
} // namespace Platform
class VoiceSelectionModel;
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
class CADENZA_EXPORT CustomizeVoicesWindowController : public QObject
{
    Q_OBJECT
public:
    explicit CustomizeVoicesWindowController(QObject *parent = nullptr);
    ~CustomizeVoicesWindowController() override;

    [[nodiscard]] QDialog *window() const { return m_window; }
    /// Opens the sheet on @p window; @p showIndividualVoiceQualities lists every quality of a voice.
    void showSheetForWindow(QWidget *window, bool showIndividualVoiceQualities);
    /// Stops the progress polling and closes the sheet.
    void close();

    void acceptVoiceSelection();
    void cancelVoiceSelection();
    void startStopPlayingSelection();
    void searchFieldChanged();

    [[nodiscard]] int numberOfRowsInTableView() const;
    [[nodiscard]] bool isGroupRow(int row) const;
    [[nodiscard]] bool shouldSelectRow(int row) const { return !isGroupRow(row); }
    /// The row view of voice row @p row: @p spare (or a new view) filled in; null for headings.
    [[nodiscard]] VoiceTableCellView *viewForRow(int row, VoiceTableCellView *spare = nullptr);
    /// The row view the table holds for @p row now; null when it has none.
    [[nodiscard]] VoiceTableCellView *existingViewForRow(int row) const;
    void tableViewSelectionDidChange();
    void soundDidFinishPlaying();
    void speechSynthesizerDidFinishSpeaking();

    void _rebuildVoiceList();
    void _updateDisplayedVoicesUsingFilterString(const QString &filter);
    void _updateButtonStates();
    void _updateRowDownloadStatus();
    void _propagateCheckboxSelection(CZVoiceRowCheckboxButton *sender);
    void _propagateDownloadCheckboxSelection(CZVoiceRowCheckboxButton *sender);
    void _propagateDownloadVariantSelection(QComboBox *sender, int index);
    void _setRowStatusFieldView(QLabel *statusField, QComboBox *variantPopUpButton,
        const CZVoiceObjectPtr &voiceObject, bool isSelected);
    void _setRowDownloadCheckbox(
        CZVoiceRowCheckboxButton *checkbox, const CZVoiceObjectPtr &voiceObject, bool isSelected);
    void _stopAndResetAllVoicePlaying();
    [[nodiscard]] bool _anyVoicePlaying() const;
    void _showPlayStopButtonAsPlaying(bool playing);
    [[nodiscard]] CZVoiceObjectPtr _voiceObjectForCurrentlySelectedRow();
    [[nodiscard]] bool _isSampleAvailableForVoiceObject(const CZVoiceObjectPtr &voiceObject) const;
    void _delayedPopUpUpdate();

    [[nodiscard]] QList<CZVoiceObjectPtr> allVoicesObjects() const { return m_allVoicesObjects; }
    [[nodiscard]] QList<VoiceTableRowPtr> currentlyDisplayedVoiceRows();
    [[nodiscard]] QSet<QString> markedForUpgradeSet() const { return m_markedForUpgradeSet; }
    [[nodiscard]] QSet<QString> markedForDeletionSet() const { return m_markedForDeletionSet; }
    [[nodiscard]] QTableView *voiceSelectionTableView() const { return m_voiceSelectionTableView; }
    [[nodiscard]] bool isDownloadStatusPolling() const;
    /// The resource path of a downloadable voice's recorded sample.
    [[nodiscard]] static QString samplePathForVoiceIdentifier(const QString &voiceIdentifier);

Q_SIGNALS:
    /// The sheet ended: accepted with OK (after any delete alert), or cancelled.
    void sheetEnded(bool accepted);

private:
    void fillRowView(VoiceTableCellView *view, const VoiceTableRowPtr &row);
    [[nodiscard]] int displayedRowOfVoice(const QString &identifier) const;
    [[nodiscard]] std::shared_ptr<class DownloadableVoice> downloadableObjectOf(
        const CZVoiceObjectPtr &voice);
    void commitAcceptedSelection(const QList<std::shared_ptr<class DownloadableVoice>> &toInstall);
    void endSheet(bool accepted);
    void stopObservingInstallations();

    QDialog *m_window;
    QTableView *m_voiceSelectionTableView;
    QPushButton *m_okButton;
    QPushButton *m_cancelButton;
    QPushButton *m_playStopButton;
    QLineEdit *m_searchField;
    QLabel *m_selectedDownloadSizeTextField;
    QLabel *m_noResultsFoundTextField;
    VoiceSelectionModel *m_model;

    std::unique_ptr<SpeechSynthesizer> m_synthesizer;
    QPointer<Platform::SoundService> m_sound; ///< while a sample plays
    QList<CZVoiceObjectPtr> m_allVoicesObjects;
    QList<std::shared_ptr<class DownloadableVoice>> m_downloadableVoices; ///< as of the last rebuild
    QList<VoiceTableRowPtr> m_currentlyDisplayedVoiceRows;
    QSet<QString> m_markedForUpgradeSet;
    QSet<QString> m_markedForDeletionSet;
    QPointer<QTimer> m_downloadStatusUpdateTimer;
    bool m_showIndividualVoiceQualities = false;
    bool m_popUpWasInitiallyBeenBuilt = false;
    mutable QRecursiveMutex m_lock;
    Platform::VisibleRowViews *m_rowViews;
    QMetaObject::Connection m_installationObservation;
};

} // namespace Cadenza

#endif
