// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_P_H
#define CADENZA_CUSTOMIZEVOICES_CUSTOMIZEVOICESWINDOWCONTROLLER_P_H

// Not public API: the voices sheet's state and internal operations, for tests and benchmarks.

#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/helpers/CustomizeSheetController_p.h"

#include <QPointer>

#include <memory>

class QComboBox;
class QPushButton;

namespace Cadenza {

class CZVoiceRowCheckboxButton;
class DownloadableVoice;
class SpeechSynthesizer;
class VoiceSelectionModel;
namespace Platform {
class SoundService;
}

class CADENZA_EXPORT CustomizeVoicesWindowControllerPrivate : public CustomizeSheetControllerPrivate
{
public:
    explicit CustomizeVoicesWindowControllerPrivate(CustomizeVoicesWindowController *q);
    ~CustomizeVoicesWindowControllerPrivate() override;

    [[nodiscard]] static CustomizeVoicesWindowControllerPrivate *get(
        CustomizeVoicesWindowController *controller)
    {
        return controller->d_func();
    }

    void _rebuildVoiceList();
    void _updateDisplayedVoicesUsingFilterString(const QString &filter);
    void _updateButtonStates();
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

    void fillRowView(VoiceTableCellView *view, const VoiceTableRowPtr &row);
    [[nodiscard]] int displayedRowOfVoice(const QString &identifier) const;
    [[nodiscard]] std::shared_ptr<DownloadableVoice> downloadableObjectOf(const CZVoiceObjectPtr &voice);

    // The sheet's rows, for CustomizeSheetControllerPrivate.
    [[nodiscard]] int rowCount() const override;
    [[nodiscard]] bool isGroupRow(int row) const override;
    [[nodiscard]] QWidget *viewForRow(int row, QWidget *spare) override;
    void rebuild() override { _rebuildVoiceList(); }
    void updateDisplayUsingFilterString(const QString &filter) override
    {
        _updateDisplayedVoicesUsingFilterString(filter);
    }
    [[nodiscard]] QVariantList activeInstallations() const override;
    [[nodiscard]] int rowOfInstallationRecord(const QVariantMap &record) override;
    void showInstallationRecord(int row, const QVariantMap &record) override;
    void selectionDidChange() override;
    [[nodiscard]] Decision decide() override;
    void stopActivity() override;
    void willPresent() override;
    void willCommit() override;

    QPushButton *playStopButton = nullptr;
    VoiceSelectionModel *voiceModel = nullptr;
    std::unique_ptr<SpeechSynthesizer> synthesizer;
    QPointer<Platform::SoundService> sound; ///< while a sample plays
    QList<CZVoiceObjectPtr> allVoicesObjects;
    QList<std::shared_ptr<DownloadableVoice>> downloadableVoices; ///< as of the last rebuild
    QList<VoiceTableRowPtr> currentlyDisplayedVoiceRows;
    QSet<QString> markedForUpgradeSet;
    bool showIndividualVoiceQualities = false;
    bool popUpWasInitiallyBeenBuilt = false;

private:
    Q_DECLARE_PUBLIC(CustomizeVoicesWindowController)
};

} // namespace Cadenza

#endif
