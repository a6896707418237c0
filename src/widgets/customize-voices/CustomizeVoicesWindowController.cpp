// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CustomizeVoicesWindowController.h"

#include "CustomizeVoicesWindowController_p.h"
#include "cadenza_logging.h"
#include "core/SpeechNames.h"
#include "core/formats/VoiceDescription.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SoundService.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/voices/DownloadableVoice.h"
#include "core/voices/SpeechSynthesizer.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CZVoiceRowTextView.h"
#include "widgets/customize-voices/VoiceSelectionModel.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/helpers/Alert.h"
#include "widgets/helpers/RowView.h"
#include "widgets/helpers/SizeVariants.h"

#include "ui_VoiceCustomization.h"

#include <QComboBox>
#include <QDialog>
#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTableView>
#include <QTimer>

#include <cmath>

namespace Cadenza {

namespace {
namespace Protocol = InstallerProtocol;
using namespace SpeechNames;

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

CZSpeechInstallationManager &manager()
{
    return *CZSpeechInstallationManager::sharedManager();
}

const DownloadableVoice *asDownloadable(const CZVoiceObjectPtr &voice)
{
    return voice->isDownloadable() ? static_cast<const DownloadableVoice *>(voice.get()) : nullptr;
}
} // namespace

CustomizeVoicesWindowControllerPrivate::CustomizeVoicesWindowControllerPrivate(
    CustomizeVoicesWindowController *q)
    : CustomizeSheetControllerPrivate(q)
{ }

CustomizeVoicesWindowControllerPrivate::~CustomizeVoicesWindowControllerPrivate()
{
    _stopAndResetAllVoicePlaying();
}

CustomizeVoicesWindowController::CustomizeVoicesWindowController(QObject *parent)
    : CustomizeSheetController(std::make_unique<CustomizeVoicesWindowControllerPrivate>(this), parent)
{
    Q_D(CustomizeVoicesWindowController);
    Ui::VoiceCustomization ui;
    ui.setupUi(d->window);
    d->playStopButton = ui.playStopButton;
    d->playStopButton->setText(texts().text(QStringLiteral("PlayButtonName")));
    d->voiceModel = new VoiceSelectionModel(this);
    d->setUpForm({ui.voiceSelectionTableView, ui.okButton, ui.cancelButton, ui.searchField,
                     ui.selectedDownloadSizeTextField, ui.noResultsFoundTextField, ui.explanationLabel},
        {QStringLiteral("VoiceCustomizationTitle"), QStringLiteral("VoiceCustomizationExplanation"),
            QStringLiteral("VoiceCustomizationTable"), QStringLiteral("DeleteDisabledVoiceAlertTitleText")},
        d->voiceModel, VoiceTableCellView().sizeHint().height());
    connect(d->playStopButton, &QPushButton::clicked, this,
        &CustomizeVoicesWindowController::startStopPlayingSelection);
}

CustomizeVoicesWindowController::~CustomizeVoicesWindowController() = default;

QList<VoiceTableRowPtr> CustomizeVoicesWindowController::currentlyDisplayedVoiceRows()
{
    Q_D(CustomizeVoicesWindowController);
    QMutexLocker locker(&d->lock);
    return d->currentlyDisplayedVoiceRows;
}

QString CustomizeVoicesWindowController::samplePathForVoiceIdentifier(const QString &voiceIdentifier)
{
    return QStringLiteral(":/cadenza/Audio/") + voiceIdentifier + QStringLiteral(".m4a");
}

void CustomizeVoicesWindowController::showSheetForWindow(QWidget *window, bool showIndividualVoiceQualities)
{
    Q_D(CustomizeVoicesWindowController);
    d->markedForUpgradeSet.clear();
    d->showIndividualVoiceQualities = showIndividualVoiceQualities;
    d->popUpWasInitiallyBeenBuilt = false;
    d->present(window, true);
}

void CustomizeVoicesWindowControllerPrivate::willPresent()
{
    playStopButton->setEnabled(false);
}

std::shared_ptr<DownloadableVoice> CustomizeVoicesWindowControllerPrivate::downloadableObjectOf(
    const CZVoiceObjectPtr &voice)
{
    if (!voice) {
        return nullptr;
    }
    if (voice->isDownloadable()) {
        return std::static_pointer_cast<DownloadableVoice>(voice);
    }
    // The list of the last rebuild: asking the manager again would ask the daemon again, per row.
    return manager().downloadableVoiceUpgradeForVoice(*voice, downloadableVoices);
}

void CustomizeVoicesWindowControllerPrivate::_rebuildVoiceList()
{
    downloadableVoices = manager().downloadableVoices();
    const QList<DownloadableVoicePtr> &downloadables = downloadableVoices;
    const QStringList installed = showIndividualVoiceQualities
        ? SpeechSynthesizer::allVoices()
        : SpeechSynthesizer::avaliableMainstreamVoices();
    QList<CZVoiceObjectPtr> voices;
    voices.reserve(installed.size() + downloadables.size());
    for (const QString &identifier : installed) {
        CZVoiceObjectPtr voice = CZVoiceObject::initWithVoiceIdentifier(identifier);
        if (!voice) {
            continue;
        }
        if (showIndividualVoiceQualities && identifier != OrinIdentifier) {
            voices.append(voice);
            continue;
        }
        if (const DownloadableVoicePtr upgrade
            = manager().downloadableVoiceUpgradeForVoice(*voice, downloadables)) {
            // The downloadable upgrade stands for the installed voice.
            voice->setDownloadStatus(upgrade->downloadStatus());
        } else {
            voices.append(voice);
        }
    }
    for (const DownloadableVoicePtr &voice : downloadables) {
        if (showIndividualVoiceQualities && voice->identifier() != OrinIdentifier
            && voice->downloadStatus() == Protocol::UpgradeAvailableStatus) {
            // Offered as a voice of its own, not as an upgrade.
            voice->setDownloadStatus(Protocol::NotInstalledStatus);
        }
        voices.append(voice);
    }
    allVoicesObjects = voices;
    (void)Platform::Services::preferences().synchronize(VoicePreferencesDomain);
    _updateDisplayedVoicesUsingFilterString(form.searchField->text());

    if (popUpWasInitiallyBeenBuilt) {
        form.okButton->setEnabled(true);
        return;
    }
    {
        QMutexLocker locker(&lock);
        for (const VoiceTableRowPtr &row : std::as_const(currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow() || !row->isSelected()) {
                continue;
            }
            const DownloadableVoicePtr downloadable = row->voiceObject()->isDownloadable()
                ? std::static_pointer_cast<DownloadableVoice>(row->voiceObject())
                : manager().downloadableVoiceUpgradeForVoice(*row->voiceObject(), downloadables);
            // Upgrades of shown voices start ticked unless the user once declined them.
            if (downloadable && downloadable->downloadStatus() == Protocol::UpgradeAvailableStatus
                && !manager().isAutoDownloadProhibitedForDownloadableVoiceObject(*downloadable)) {
                markedForUpgradeSet.insert(downloadable->identifier());
            }
        }
    }
    popUpWasInitiallyBeenBuilt = true;
    form.okButton->setEnabled(true);
}

void CustomizeVoicesWindowControllerPrivate::_updateDisplayedVoicesUsingFilterString(const QString &filter)
{
    Q_Q(CustomizeVoicesWindowController);
    const bool anyMatchesLocale = std::any_of(allVoicesObjects.cbegin(), allVoicesObjects.cend(),
        [](const CZVoiceObjectPtr &voice) { return voice->doesMatchSystemLocale(); });
    const bool languageCodeOnly = !anyMatchesLocale;
    {
        QMutexLocker locker(&lock);
        QList<CZVoiceObjectPtr> candidates;
        if (filter.isEmpty()) {
            candidates = allVoicesObjects;
        } else {
            for (const CZVoiceObjectPtr &voice : std::as_const(allVoicesObjects)) {
                if (voice->matchesSearchString(filter)) {
                    candidates.append(voice);
                }
            }
        }
        currentlyDisplayedVoiceRows
            = VoiceTableRow::arrangedRowsFromVoiceObjects(candidates, languageCodeOnly, false, true, true);
        voiceModel->setRows(currentlyDisplayedVoiceRows, showIndividualVoiceQualities);
        showWhetherAnythingMatched(!currentlyDisplayedVoiceRows.isEmpty());
    }
    QTimer::singleShot(1000, q, [this] { _updateButtonStates(); });
}

int CustomizeVoicesWindowControllerPrivate::rowCount() const
{
    return int(currentlyDisplayedVoiceRows.size());
}

bool CustomizeVoicesWindowControllerPrivate::isGroupRow(int row) const
{
    QMutexLocker locker(&lock);
    return row >= 0 && row < currentlyDisplayedVoiceRows.size()
        && currentlyDisplayedVoiceRows.at(row)->isGroupRow();
}

bool CustomizeVoicesWindowController::isGroupRow(int row) const
{
    Q_D(const CustomizeVoicesWindowController);
    return d->isGroupRow(row);
}

VoiceTableCellView *CustomizeVoicesWindowController::existingViewForRow(int row) const
{
    Q_D(const CustomizeVoicesWindowController);
    return qobject_cast<VoiceTableCellView *>(d->existingViewForRow(row));
}

VoiceTableCellView *CustomizeVoicesWindowController::viewForRow(int row, VoiceTableCellView *spare)
{
    Q_D(CustomizeVoicesWindowController);
    return static_cast<VoiceTableCellView *>(d->viewForRow(row, spare));
}

QWidget *CustomizeVoicesWindowControllerPrivate::viewForRow(int row, QWidget *spare)
{
    Q_Q(CustomizeVoicesWindowController);
    QMutexLocker locker(&lock);
    if (row < 0 || row >= currentlyDisplayedVoiceRows.size()) {
        return nullptr;
    }
    const VoiceTableRowPtr &entry = currentlyDisplayedVoiceRows.at(row);
    if (entry->isGroupRow()) {
        return nullptr; // headings are drawn by the table itself
    }
    auto *view = qobject_cast<VoiceTableCellView *>(spare);
    if (!view) {
        view = new VoiceTableCellView;
        QObject::connect(view->activeCheckbox(), &QAbstractButton::clicked, q,
            [this, box = view->activeCheckbox()] { _propagateCheckboxSelection(box); });
        QObject::connect(view->downloadCheckbox(), &QAbstractButton::clicked, q,
            [this, box = view->downloadCheckbox()] { _propagateDownloadCheckboxSelection(box); });
        QObject::connect(view->downloadVariantPopUpButton(), &QComboBox::activated, q,
            [this, sizes = view->downloadVariantPopUpButton()](
                int index) { _propagateDownloadVariantSelection(sizes, index); });
    }
    fillRowView(view, entry);
    return view;
}

void CustomizeVoicesWindowControllerPrivate::fillRowView(
    VoiceTableCellView *view, const VoiceTableRowPtr &row)
{
    const CZVoiceObjectPtr &voice = row->voiceObject();
    const QString label = voiceModel->labelForVoice(*voice);
    view->textField()->setText(label);
    const qint64 status = voice->downloadStatus();
    const bool fetching = status == Protocol::DownloadingStatus || status == Protocol::WaitingStatus;
    view->textField()->setEnabled(!fetching); // the disabled text colour
    view->activeCheckbox()->setEnabled(!fetching);
    view->activeCheckbox()->setChecked(row->isSelected());
    view->activeCheckbox()->setVoiceIdentifier(voice->identifier());
    view->activeCheckbox()->setObjectName(QStringLiteral("activeCheckbox"));
    view->activeCheckbox()->setProperty("cellIdentifier", QStringLiteral("_CADENZA_VOICE_CHECKBOX"));
    view->activeCheckbox()->setAccessibleName(voiceModel->accessibleNameForVoice(*voice));
    // A pop-up reads its choice as its name on Linux and its label elsewhere; the description says
    // what it chooses on every platform.
    const QString sizeChoice = texts().format(QStringLiteral("DownloadVariantAccessibleFormat"), {label});
    view->downloadVariantPopUpButton()->setAccessibleName(sizeChoice);
    view->downloadVariantPopUpButton()->setAccessibleDescription(sizeChoice);
    _setRowStatusFieldView(
        view->downloadMessageTextField(), view->downloadVariantPopUpButton(), voice, row->isSelected());
    _setRowDownloadCheckbox(view->downloadCheckbox(), voice, row->isSelected());
}

void CustomizeVoicesWindowControllerPrivate::_setRowStatusFieldView(
    QLabel *statusField, QComboBox *variantPopUpButton, const CZVoiceObjectPtr &voiceObject, bool isSelected)
{
    variantPopUpButton->hide();
    const qint64 status = voiceObject->downloadStatus();
    if (const DownloadableVoice *downloadable = asDownloadable(voiceObject); downloadable
        && status == Protocol::NotInstalledStatus && isSelected
        && !downloadable->fullSizeBundleIdentifier().isEmpty()) {
        Platform::SizeVariants::show(variantPopUpButton, voiceObject->identifier(), downloadable->byteSize(),
            downloadable->fullSizeByteSize(), downloadable->downloadFullSize());
    }
    Platform::RowView::setStatusText(
        statusField, rowStatusText(status, voiceObject->downloadPercentComplete(), isSelected));
}

void CustomizeVoicesWindowControllerPrivate::_setRowDownloadCheckbox(
    CZVoiceRowCheckboxButton *checkbox, const CZVoiceObjectPtr &voiceObject, bool isSelected)
{
    checkbox->setVoiceIdentifier(voiceObject->identifier());
    if (voiceObject->downloadStatus() == Protocol::UpgradeAvailableStatus && isSelected) {
        // The format's one argument is the size the upgrade would fetch.
        const DownloadableVoicePtr upgrade = downloadableObjectOf(voiceObject);
        const quint64 size = !upgrade
            ? 0
            : (upgrade->downloadFullSize() ? upgrade->fullSizeByteSize() : upgrade->byteSize());
        checkbox->setText(texts().format(QStringLiteral("DownloadStatusCheckboxTextUpradeItemFormat"),
            {CZSpeechItem::displayStringForByteSize(size)}));
        checkbox->setChecked(markedForUpgradeSet.contains(voiceObject->identifier()));
        checkbox->show();
    } else {
        checkbox->hide();
    }
}

int CustomizeVoicesWindowControllerPrivate::displayedRowOfVoice(const QString &identifier) const
{
    QMutexLocker locker(&lock);
    for (int row = 0; row < currentlyDisplayedVoiceRows.size(); ++row) {
        const CZVoiceObjectPtr &voice = currentlyDisplayedVoiceRows.at(row)->voiceObject();
        if (voice && voice->identifier() == identifier) {
            return row;
        }
    }
    return -1;
}

void CustomizeVoicesWindowControllerPrivate::_propagateCheckboxSelection(CZVoiceRowCheckboxButton *sender)
{
    Q_Q(CustomizeVoicesWindowController);
    QMutexLocker locker(&lock);
    const int row = displayedRowOfVoice(sender->voiceIdentifier());
    if (row < 0) {
        _updateButtonStates();
        return;
    }
    const VoiceTableRowPtr entry = currentlyDisplayedVoiceRows.at(row);
    const bool ticked = sender->isChecked();
    entry->setSelected(ticked);
    const CZVoiceObjectPtr voice = entry->voiceObject();
    const QString identifier = voice->identifier();
    VoiceTableCellView *view = q->existingViewForRow(row);
    switch (voice->downloadStatus()) {
    case Protocol::NotInstalledStatus:
        if (view) {
            _setRowStatusFieldView(
                view->downloadMessageTextField(), view->downloadVariantPopUpButton(), voice, ticked);
        }
        break;
    case Protocol::UpgradeAvailableStatus:
        if (!ticked) {
            markedForUpgradeSet.remove(identifier);
            if (identifier == OrinIdentifier) {
                markedForDeletionSet.insert(identifier); // an unticked Orin with an upgrade goes
            }
        } else if (const auto downloadable = downloadableObjectOf(voice); !downloadable
                   || !manager().isAutoDownloadProhibitedForDownloadableVoiceObject(*downloadable)) {
            markedForUpgradeSet.insert(identifier);
        }
        if (view) {
            _setRowDownloadCheckbox(view->downloadCheckbox(), voice, ticked);
        }
        break;
    case Protocol::InstalledStatus:
        if (ticked) {
            markedForDeletionSet.remove(identifier);
        } else if (manager().bundleForRemovableVoice(*voice, nullptr)) {
            markedForDeletionSet.insert(identifier); // voices that cannot be removed are only hidden
        }
        if (view) {
            _setRowDownloadCheckbox(view->downloadCheckbox(), voice, ticked);
        }
        break;
    default:
        break;
    }
    voiceModel->refreshVoiceRow(row);
    form.table->setFocus();
    form.table->selectRow(row);
    form.okButton->setEnabled(true);
    _updateButtonStates();
}

void CustomizeVoicesWindowControllerPrivate::_propagateDownloadCheckboxSelection(
    CZVoiceRowCheckboxButton *sender)
{
    QMutexLocker locker(&lock);
    const int row = displayedRowOfVoice(sender->voiceIdentifier());
    if (row >= 0) {
        const CZVoiceObjectPtr voice = currentlyDisplayedVoiceRows.at(row)->voiceObject();
        const bool checked = sender->isChecked();
        if (checked) {
            markedForUpgradeSet.insert(voice->identifier());
            form.okButton->setEnabled(true);
        } else {
            markedForUpgradeSet.remove(voice->identifier());
        }
        // A declined upgrade is remembered and no longer ticked in advance.
        if (const auto downloadable = downloadableObjectOf(voice)) {
            manager().markDownloadableVoiceObject(*downloadable, !checked);
        }
    }
    _updateButtonStates();
}

void CustomizeVoicesWindowControllerPrivate::_propagateDownloadVariantSelection(QComboBox *sender, int index)
{
    QMutexLocker locker(&lock);
    const QString identifier = Platform::SizeVariants::identifier(sender, index);
    const int row = displayedRowOfVoice(identifier);
    if (row >= 0) {
        const CZVoiceObjectPtr voice = currentlyDisplayedVoiceRows.at(row)->voiceObject();
        if (voice->isDownloadable()) {
            std::static_pointer_cast<DownloadableVoice>(voice)->setDownloadFullSize(
                Platform::SizeVariants::isFullSize(sender, index));
        }
        sender->setCurrentIndex(index);
        form.okButton->setEnabled(true);
    }
    _updateButtonStates();
}

void CustomizeVoicesWindowControllerPrivate::_updateButtonStates()
{
    quint64 total = 0;
    {
        QMutexLocker locker(&lock);
        for (const VoiceTableRowPtr &row : std::as_const(currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow() || !row->isSelected()) {
                continue;
            }
            const CZVoiceObjectPtr &voice = row->voiceObject();
            const qint64 status = voice->downloadStatus();
            const bool upgrading = status == Protocol::UpgradeAvailableStatus
                && markedForUpgradeSet.contains(voice->identifier());
            if (status != Protocol::NotInstalledStatus && !upgrading) {
                continue;
            }
            if (const DownloadableVoice *downloadable = asDownloadable(voice)) {
                total += downloadable->downloadFullSize() ? downloadable->fullSizeByteSize()
                                                          : downloadable->byteSize();
            }
        }
    }
    playStopButton->setEnabled(_isSampleAvailableForVoiceObject(_voiceObjectForCurrentlySelectedRow()));
    showSelectedDownloadSize(total);
}

bool CustomizeVoicesWindowControllerPrivate::_isSampleAvailableForVoiceObject(
    const CZVoiceObjectPtr &voiceObject) const
{
    if (!voiceObject) {
        return false;
    }
    if (voiceObject->isDownloadable()) {
        return QFile::exists(
            CustomizeVoicesWindowController::samplePathForVoiceIdentifier(voiceObject->identifier()));
    }
    return true;
}

CZVoiceObjectPtr CustomizeVoicesWindowControllerPrivate::_voiceObjectForCurrentlySelectedRow()
{
    QMutexLocker locker(&lock);
    const QModelIndexList selected = form.table->selectionModel()->selectedRows();
    if (selected.isEmpty()) {
        return nullptr;
    }
    const int row = selected.first().row();
    if (row < 0 || row >= currentlyDisplayedVoiceRows.size()) {
        return nullptr;
    }
    return currentlyDisplayedVoiceRows.at(row)->voiceObject();
}

bool CustomizeVoicesWindowControllerPrivate::_anyVoicePlaying() const
{
    const bool soundPlaying = sound && sound->isActive();
    return soundPlaying || (synthesizer && synthesizer->isSpeaking());
}

void CustomizeVoicesWindowControllerPrivate::_stopAndResetAllVoicePlaying()
{
    if (sound) {
        sound->disconnect(q_ptr);
        sound->stop();
        sound = nullptr;
    }
    if (synthesizer) {
        synthesizer->disconnect(q_ptr);
        synthesizer->stopSpeaking();
        synthesizer.reset();
    }
}

void CustomizeVoicesWindowControllerPrivate::_showPlayStopButtonAsPlaying(bool playing)
{
    playStopButton->setText(
        texts().text(playing ? QStringLiteral("StopButtonName") : QStringLiteral("PlayButtonName")));
}

void CustomizeVoicesWindowControllerPrivate::stopActivity()
{
    _stopAndResetAllVoicePlaying();
    _showPlayStopButtonAsPlaying(false);
}

void CustomizeVoicesWindowController::startStopPlayingSelection()
{
    Q_D(CustomizeVoicesWindowController);
    const bool wasPlaying = d->_anyVoicePlaying();
    d->_stopAndResetAllVoicePlaying();
    if (wasPlaying) {
        d->_showPlayStopButtonAsPlaying(false);
        return;
    }
    const CZVoiceObjectPtr voice = d->_voiceObjectForCurrentlySelectedRow();
    if (!voice) {
        d->_showPlayStopButtonAsPlaying(false);
        return;
    }
    bool started = false;
    if (voice->isDownloadable()) {
        QFile sample(samplePathForVoiceIdentifier(voice->identifier()));
        if (!sample.open(QIODevice::ReadOnly)) {
            qCWarning(lcSheets, "No recorded sample for %s", qPrintable(voice->identifier()));
            Platform::Alert::beep();
            return;
        }
        // Loaded into memory, not played by reference. The sound service answers later: the button
        // shows Stop once the sample is audible; one that cannot play beeps and leaves it on Play.
        d->sound = &Platform::Services::sound();
        connect(
            d->sound, &Platform::SoundService::started, this, [d] { d->_showPlayStopButtonAsPlaying(true); });
        connect(d->sound, &Platform::SoundService::finished, this,
            &CustomizeVoicesWindowController::soundDidFinishPlaying);
        connect(d->sound, &Platform::SoundService::failed, this, [this] {
            Platform::Alert::beep();
            soundDidFinishPlaying();
        });
        d->sound->play(sample.readAll(), QStringLiteral("sample.m4a"));
    } else {
        d->synthesizer = SpeechSynthesizer::initWithVoice(voice->identifier());
        if (d->synthesizer) {
            connect(d->synthesizer.get(), &SpeechSynthesizer::didFinishSpeaking, this,
                &CustomizeVoicesWindowController::speechSynthesizerDidFinishSpeaking);
            started = d->synthesizer->startSpeakingString(
                voice->voiceAttributes().value(Platform::VoiceAttribute::DemoText).toString());
        }
    }
    d->_showPlayStopButtonAsPlaying(started);
}

void CustomizeVoicesWindowController::soundDidFinishPlaying()
{
    QTimer::singleShot(0, this, [this] {
        Q_D(CustomizeVoicesWindowController);
        if (!d->_anyVoicePlaying()) {
            d->_showPlayStopButtonAsPlaying(false);
        }
    });
}

void CustomizeVoicesWindowController::speechSynthesizerDidFinishSpeaking()
{
    Q_D(CustomizeVoicesWindowController);
    if (!d->_anyVoicePlaying()) {
        d->_showPlayStopButtonAsPlaying(false);
    }
}

void CustomizeVoicesWindowController::tableViewSelectionDidChange()
{
    Q_D(CustomizeVoicesWindowController);
    if (d->_anyVoicePlaying()) {
        d->_stopAndResetAllVoicePlaying();
        startStopPlayingSelection();
    }
    d->_updateButtonStates();
}

void CustomizeVoicesWindowControllerPrivate::selectionDidChange()
{
    Q_Q(CustomizeVoicesWindowController);
    q->tableViewSelectionDidChange();
}

QVariantList CustomizeVoicesWindowControllerPrivate::activeInstallations() const
{
    return manager().activeVoiceInstallations();
}

int CustomizeVoicesWindowControllerPrivate::rowOfInstallationRecord(const QVariantMap &record)
{
    for (int row = 0; row < currentlyDisplayedVoiceRows.size(); ++row) {
        const CZVoiceObjectPtr &voice = currentlyDisplayedVoiceRows.at(row)->voiceObject();
        if (!voice) {
            continue;
        }
        // The record may name the full-size voice being fetched rather than the row's own.
        const auto match = CZSpeechInstallationManager::installationRecordMatch(record, *voice);
        if (match == CZSpeechInstallationManager::RecordMatch::FullSize) {
            std::static_pointer_cast<DownloadableVoice>(voice)->setDownloadFullSize(true);
        }
        if (match != CZSpeechInstallationManager::RecordMatch::None) {
            return row;
        }
    }
    return -1;
}

void CustomizeVoicesWindowControllerPrivate::showInstallationRecord(int row, const QVariantMap &record)
{
    Q_Q(CustomizeVoicesWindowController);
    const VoiceTableRowPtr &displayed = currentlyDisplayedVoiceRows.at(row);
    const CZVoiceObjectPtr &voice = displayed->voiceObject();
    voice->setDownloadStatus(record.value(Protocol::ItemDownloadStatusKey).toLongLong());
    voice->setDownloadPercentComplete(record.value(Protocol::ItemPercentCompleteKey).toDouble());
    if (VoiceTableCellView *view = q->existingViewForRow(row)) {
        _setRowStatusFieldView(view->downloadMessageTextField(), view->downloadVariantPopUpButton(), voice,
            displayed->isSelected());
    }
}

void CustomizeVoicesWindowControllerPrivate::_delayedPopUpUpdate()
{
    Platform::Services::notifications().postNotification(DefaultVoiceChangedNotification);
}

void CustomizeVoicesWindowControllerPrivate::willCommit()
{
    {
        const QSignalBlocker blocker(form.searchField);
        form.searchField->clear();
    }
    _updateDisplayedVoicesUsingFilterString(QString());
}

CustomizeSheetControllerPrivate::Decision CustomizeVoicesWindowControllerPrivate::decide()
{
    QMutexLocker locker(&lock);
    QList<CZVoiceObjectPtr> voices;
    QList<SelectionRow> rows;
    for (const VoiceTableRowPtr &row : std::as_const(currentlyDisplayedVoiceRows)) {
        if (row->isGroupRow()) {
            continue;
        }
        const CZVoiceObjectPtr &voice = row->voiceObject();
        SelectionRow entry;
        entry.identifier = voice->identifier();
        entry.visibility = voice->visibility();
        entry.visibilityIdentifiers = {voice->identifier()};
        // A voice fetched at full size installs its full-size voice: the tick follows it there.
        if (const DownloadableVoice *downloadable = asDownloadable(voice); downloadable && row->isSelected()
            && downloadable->downloadFullSize() && !downloadable->fullSizeBundleIdentifier().isEmpty()
            && downloadable->fullSizeBundleIdentifier() != voice->identifier()) {
            entry.visibilityIdentifiers.append(downloadable->fullSizeBundleIdentifier());
        }
        entry.downloadStatus = voice->downloadStatus();
        entry.selected = row->isSelected();
        entry.markedForUpgrade = markedForUpgradeSet.contains(voice->identifier());
        entry.markedForDeletion = markedForDeletionSet.contains(voice->identifier());
        entry.removableWithUpgradeAvailable = voice->identifier() == OrinIdentifier;
        rows.append(entry);
        voices.append(voice);
    }
    QVariantMap table = CZVoiceObject::visibleVoicesTable().value_or(QVariantMap());
    // A missing entry counts as 0 when shown, so every shown voice ends up with one.
    const auto stored = [&table](const QString &identifier) -> std::optional<qint64> {
        const auto entry = table.constFind(identifier);
        return entry == table.constEnd() ? std::nullopt : std::optional<qint64>(entry->toLongLong());
    };
    Decision decision;
    decision.changes
        = decideSelectionChanges(rows, stored, true, SpeechSynthesizer::defaultVoiceFromMainstreamVoices());
    if (!decision.changes.visibility.isEmpty()) {
        for (auto entry = decision.changes.visibility.cbegin(); entry != decision.changes.visibility.cend();
             ++entry) {
            table.insert(entry.key(), entry.value());
        }
        CZVoiceObject::setVisibleVoicesTable(table);
    }

    QList<DownloadableVoicePtr> toInstall;
    for (const qsizetype index : std::as_const(decision.changes.install)) {
        if (const auto downloadable = downloadableObjectOf(voices.at(index))) {
            toInstall.append(downloadable);
        }
    }
    QList<RemovableSpeechItem> toRemove;
    for (const qsizetype index : std::as_const(decision.changes.remove)) {
        toRemove.append(voices.at(index));
    }
    const bool removesDefault = decision.changes.removesDefault;
    decision.remove = [toRemove, removesDefault] {
        manager().startRemovingDownloadedSpeechItems(toRemove);
        if (removesDefault) {
            Platform::PreferencesStore &preferences = Platform::Services::preferences();
            for (const QString &key : {SelectedVoiceCreatorKey, SelectedVoiceIDKey, SelectedVoiceNameKey}) {
                preferences.setValue(key, QVariant(), VoicePreferencesDomain);
            }
            (void)preferences.synchronize(VoicePreferencesDomain);
        }
    };
    const bool useRootNames = !showIndividualVoiceQualities;
    decision.commit = [this, toInstall, useRootNames] {
        if (!toInstall.isEmpty()) {
            (void)manager().startInstallingDownloadableVoices(toInstall, useRootNames, 0);
        }
        QTimer::singleShot(2000, q_ptr, [this] { _delayedPopUpUpdate(); });
    };
    return decision;
}

void CustomizeVoicesWindowController::acceptVoiceSelection()
{
    acceptSheet();
}

void CustomizeVoicesWindowController::cancelVoiceSelection()
{
    cancelSheet();
}

} // namespace Cadenza
