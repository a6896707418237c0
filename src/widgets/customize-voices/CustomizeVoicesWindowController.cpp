#include "CustomizeVoicesWindowController.h"

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
#include "widgets/helpers/VisibleRowViews.h"

#include "ui_VoiceCustomization.h"

#include <QComboBox>
#include <QDialog>
#include <QFile>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QLocale>
#include <QPushButton>
#include <QScrollBar>
#include <QStyle>
#include <QTableView>
#include <QTimer>
#include <QToolButton>

#include <cmath>

namespace Cadenza {

namespace {
const QString OrinIdentifier = QStringLiteral("com.vendra.speech.synthesis.voice.Orin");
const QString VoicePreferencesDomain = QStringLiteral("com.vendra.speech.voice.prefs");
const QString DefaultVoiceChangedNotification
    = QStringLiteral("com.vendra.speech.DefaultVoiceChangedNotification");
constexpr int StatusPollMilliseconds = 2000;

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

CZSpeechInstallationManager &manager()
{
    return *CZSpeechInstallationManager::sharedManager();
}
} // namespace

CustomizeVoicesWindowController::CustomizeVoicesWindowController(QObject *parent)
    : QObject(parent)
    , m_window(new QDialog)
    , m_model(new VoiceSelectionModel(this))
{
    Ui::VoiceCustomization ui;
    ui.setupUi(m_window);
    m_voiceSelectionTableView = ui.voiceSelectionTableView;
    m_okButton = ui.okButton;
    m_cancelButton = ui.cancelButton;
    m_playStopButton = ui.playStopButton;
    m_searchField = ui.searchField;
    m_selectedDownloadSizeTextField = ui.selectedDownloadSizeTextField;
    m_noResultsFoundTextField = ui.noResultsFoundTextField;

    m_window->setWindowTitle(texts().text(QStringLiteral("VoiceCustomizationTitle")));
    ui.explanationLabel->setText(texts().text(QStringLiteral("VoiceCustomizationExplanation")));
    m_searchField->setPlaceholderText(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    m_searchField->setAccessibleName(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    // The field's clear button is a control of its own.
    for (QToolButton *clear : m_searchField->findChildren<QToolButton *>()) {
        clear->setAccessibleName(texts().text(QStringLiteral("SearchClearButtonName")));
    }
    m_noResultsFoundTextField->setText(texts().text(QStringLiteral("VoiceCustomizationNoResults")));
    m_okButton->setText(texts().text(QStringLiteral("OK")));
    m_cancelButton->setText(texts().text(QStringLiteral("Cancel")));
    m_playStopButton->setText(texts().text(QStringLiteral("PlayButtonName")));
    m_voiceSelectionTableView->setAccessibleName(texts().text(QStringLiteral("VoiceCustomizationTable")));

    m_model->setColumnTitle(m_voiceSelectionTableView->accessibleName());
    m_voiceSelectionTableView->setModel(m_model);
    m_rowViews = new Platform::VisibleRowViews(
        m_voiceSelectionTableView,
        [this](int row, QWidget *spare) -> QWidget * {
            return viewForRow(row, qobject_cast<VoiceTableCellView *>(spare));
        },
        this);
    // One height for all rows: the view can then place 10,000 rows without measuring them.
    m_voiceSelectionTableView->verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    m_voiceSelectionTableView->verticalHeader()->setDefaultSectionSize(
        VoiceTableCellView().sizeHint().height());

    connect(m_okButton, &QPushButton::clicked, this, &CustomizeVoicesWindowController::acceptVoiceSelection);
    connect(
        m_cancelButton, &QPushButton::clicked, this, &CustomizeVoicesWindowController::cancelVoiceSelection);
    connect(m_playStopButton, &QPushButton::clicked, this,
        &CustomizeVoicesWindowController::startStopPlayingSelection);
    connect(
        m_searchField, &QLineEdit::textChanged, this, &CustomizeVoicesWindowController::searchFieldChanged);
    connect(m_voiceSelectionTableView->selectionModel(), &QItemSelectionModel::selectionChanged, this,
        &CustomizeVoicesWindowController::tableViewSelectionDidChange);
    connect(m_window, &QDialog::rejected, this, [this] {
        if (m_window->isVisible() || m_downloadStatusUpdateTimer) {
            cancelVoiceSelection();
        }
    });
}

CustomizeVoicesWindowController::~CustomizeVoicesWindowController()
{
    _stopAndResetAllVoicePlaying();
    delete m_rowViews; // before the table it works on
    delete m_window;
}

QList<VoiceTableRowPtr> CustomizeVoicesWindowController::currentlyDisplayedVoiceRows()
{
    QMutexLocker locker(&m_lock);
    return m_currentlyDisplayedVoiceRows;
}

bool CustomizeVoicesWindowController::isDownloadStatusPolling() const
{
    return m_downloadStatusUpdateTimer && m_downloadStatusUpdateTimer->isActive();
}

QString CustomizeVoicesWindowController::samplePathForVoiceIdentifier(const QString &voiceIdentifier)
{
    return QStringLiteral(":/cadenza/Audio/") + voiceIdentifier + QStringLiteral(".m4a");
}

void CustomizeVoicesWindowController::showSheetForWindow(QWidget *window, bool showIndividualVoiceQualities)
{
    {
        const QSignalBlocker blocker(m_searchField);
        m_searchField->clear();
    }
    m_searchField->setFocus();
    m_markedForUpgradeSet.clear();
    m_markedForDeletionSet.clear();
    m_showIndividualVoiceQualities = showIndividualVoiceQualities;
    m_popUpWasInitiallyBeenBuilt = false;
    _rebuildVoiceList();

    delete m_downloadStatusUpdateTimer.data();
    m_downloadStatusUpdateTimer = new QTimer(this);
    m_downloadStatusUpdateTimer->setInterval(StatusPollMilliseconds);
    connect(m_downloadStatusUpdateTimer, &QTimer::timeout, this,
        &CustomizeVoicesWindowController::_updateRowDownloadStatus);
    m_downloadStatusUpdateTimer->start();

    m_selectedDownloadSizeTextField->clear();
    m_playStopButton->setEnabled(false);
    m_voiceSelectionTableView->scrollToTop();

    if (window) {
        m_window->setParent(window->window(), m_window->windowFlags());
    }
    m_window->setWindowModality(window ? Qt::WindowModal : Qt::ApplicationModal);
    m_window->show();
    m_rowViews->sync();

    stopObservingInstallations();
    // The installer spells the notification so.
    m_installationObservation = connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, this, [this](const QString &name) {
            if (name == InstallerProtocol::FinishedInstallationNotification) {
                _rebuildVoiceList();
            }
        });
    if (window) {
        window->window()->raise();
    }
}

void CustomizeVoicesWindowController::stopObservingInstallations()
{
    disconnect(m_installationObservation);
    m_installationObservation = {};
}

void CustomizeVoicesWindowController::close()
{
    if (m_downloadStatusUpdateTimer) {
        m_downloadStatusUpdateTimer->stop();
        m_downloadStatusUpdateTimer->deleteLater();
        m_downloadStatusUpdateTimer = nullptr;
    }
    m_window->hide();
}

void CustomizeVoicesWindowController::endSheet(bool accepted)
{
    if (m_window->parentWidget()) {
        // Back to a window of its own, so the client's window can go without taking the sheet along.
        m_window->setParent(nullptr, m_window->windowFlags());
    }
    Q_EMIT sheetEnded(accepted);
}

std::shared_ptr<DownloadableVoice> CustomizeVoicesWindowController::downloadableObjectOf(
    const CZVoiceObjectPtr &voice)
{
    if (!voice) {
        return nullptr;
    }
    if (voice->isDownloadable()) {
        return std::static_pointer_cast<DownloadableVoice>(voice);
    }
    // The list of the last rebuild: asking the manager again would ask the daemon again, per row.
    return manager().downloadableVoiceUpgradeForVoice(*voice, m_downloadableVoices);
}

void CustomizeVoicesWindowController::_rebuildVoiceList()
{
    m_downloadableVoices = manager().downloadableVoices();
    const QList<DownloadableVoicePtr> &downloadables = m_downloadableVoices;
    const QStringList installed = m_showIndividualVoiceQualities
        ? SpeechSynthesizer::allVoices()
        : SpeechSynthesizer::avaliableMainstreamVoices();
    QList<CZVoiceObjectPtr> voices;
    voices.reserve(installed.size() + downloadables.size());
    for (const QString &identifier : installed) {
        CZVoiceObjectPtr voice = CZVoiceObject::initWithVoiceIdentifier(identifier);
        if (!voice) {
            continue;
        }
        if (m_showIndividualVoiceQualities && identifier != OrinIdentifier) {
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
        if (m_showIndividualVoiceQualities && voice->identifier() != OrinIdentifier
            && voice->downloadStatus() == 1) {
            voice->setDownloadStatus(2); // offered as a voice of its own, not as an upgrade
        }
        voices.append(voice);
    }
    m_allVoicesObjects = voices;
    (void)Platform::Services::preferences().synchronize(VoicePreferencesDomain);
    _updateDisplayedVoicesUsingFilterString(m_searchField->text());

    if (m_popUpWasInitiallyBeenBuilt) {
        m_okButton->setEnabled(true);
        return;
    }
    {
        QMutexLocker locker(&m_lock);
        for (const VoiceTableRowPtr &row : std::as_const(m_currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow() || !row->isSelected()) {
                continue;
            }
            const DownloadableVoicePtr downloadable = row->voiceObject()->isDownloadable()
                ? std::static_pointer_cast<DownloadableVoice>(row->voiceObject())
                : manager().downloadableVoiceUpgradeForVoice(*row->voiceObject(), downloadables);
            // Upgrades of shown voices start ticked unless the user once declined them.
            if (downloadable && downloadable->downloadStatus() == 1
                && !manager().isAutoDownloadProhibitedForDownloadableVoiceObject(*downloadable)) {
                m_markedForUpgradeSet.insert(downloadable->identifier());
            }
        }
    }
    m_popUpWasInitiallyBeenBuilt = true;
    m_okButton->setEnabled(true);
}

void CustomizeVoicesWindowController::_updateDisplayedVoicesUsingFilterString(const QString &filter)
{
    const bool anyMatchesLocale = std::any_of(m_allVoicesObjects.cbegin(), m_allVoicesObjects.cend(),
        [](const CZVoiceObjectPtr &voice) { return voice->doesMatchSystemLocale(); });
    const bool languageCodeOnly = !anyMatchesLocale;
    {
        QMutexLocker locker(&m_lock);
        QList<CZVoiceObjectPtr> candidates;
        if (filter.isEmpty()) {
            candidates = m_allVoicesObjects;
        } else {
            for (const CZVoiceObjectPtr &voice : std::as_const(m_allVoicesObjects)) {
                if (voice->matchesSearchString(filter)) {
                    candidates.append(voice);
                }
            }
        }
        m_currentlyDisplayedVoiceRows
            = VoiceTableRow::arrangedRowsFromVoiceObjects(candidates, languageCodeOnly, false, true, true);
        m_model->setRows(m_currentlyDisplayedVoiceRows, m_showIndividualVoiceQualities);
        m_noResultsFoundTextField->setVisible(m_currentlyDisplayedVoiceRows.isEmpty());
        // Said while the search field has the focus, so a screen reader hears that nothing matched.
        m_searchField->setAccessibleDescription(
            m_currentlyDisplayedVoiceRows.isEmpty() ? m_noResultsFoundTextField->text() : QString());
    }
    QTimer::singleShot(1000, this, &CustomizeVoicesWindowController::_updateButtonStates);
}

void CustomizeVoicesWindowController::searchFieldChanged()
{
    _updateDisplayedVoicesUsingFilterString(m_searchField->text());
}

int CustomizeVoicesWindowController::numberOfRowsInTableView() const
{
    QMutexLocker locker(&m_lock);
    return int(m_currentlyDisplayedVoiceRows.size());
}

bool CustomizeVoicesWindowController::isGroupRow(int row) const
{
    QMutexLocker locker(&m_lock);
    return row >= 0 && row < m_currentlyDisplayedVoiceRows.size()
        && m_currentlyDisplayedVoiceRows.at(row)->isGroupRow();
}

VoiceTableCellView *CustomizeVoicesWindowController::existingViewForRow(int row) const
{
    return qobject_cast<VoiceTableCellView *>(m_rowViews->viewForRow(row));
}

VoiceTableCellView *CustomizeVoicesWindowController::viewForRow(int row, VoiceTableCellView *spare)
{
    QMutexLocker locker(&m_lock);
    if (row < 0 || row >= m_currentlyDisplayedVoiceRows.size()) {
        return nullptr;
    }
    const VoiceTableRowPtr &entry = m_currentlyDisplayedVoiceRows.at(row);
    if (entry->isGroupRow()) {
        return nullptr; // headings are drawn by the table itself
    }
    VoiceTableCellView *view = spare;
    if (!view) {
        view = new VoiceTableCellView;
        connect(view->activeCheckbox(), &QAbstractButton::clicked, this,
            [this, box = view->activeCheckbox()] { _propagateCheckboxSelection(box); });
        connect(view->downloadCheckbox(), &QAbstractButton::clicked, this,
            [this, box = view->downloadCheckbox()] { _propagateDownloadCheckboxSelection(box); });
        connect(view->downloadVariantPopUpButton(), &QComboBox::activated, this,
            [this, sizes = view->downloadVariantPopUpButton()](
                int index) { _propagateDownloadVariantSelection(sizes, index); });
    }
    fillRowView(view, entry);
    return view;
}

void CustomizeVoicesWindowController::fillRowView(VoiceTableCellView *view, const VoiceTableRowPtr &row)
{
    const CZVoiceObjectPtr &voice = row->voiceObject();
    const QString label = m_model->labelForVoice(*voice);
    view->textField()->setText(label);
    const qint64 status = voice->downloadStatus();
    const bool fetching = status == 3 || status == 4;
    view->textField()->setEnabled(!fetching); // the disabled text colour
    view->activeCheckbox()->setEnabled(!fetching);
    view->activeCheckbox()->setChecked(row->isSelected());
    view->activeCheckbox()->setVoiceIdentifier(voice->identifier());
    view->activeCheckbox()->setObjectName(QStringLiteral("activeCheckbox"));
    view->activeCheckbox()->setProperty("cellIdentifier", QStringLiteral("_CADENZA_VOICE_CHECKBOX"));
    view->activeCheckbox()->setAccessibleName(m_model->accessibleNameForVoice(*voice));
    // A pop-up reads its choice as its name on Linux and its label elsewhere; the description says
    // what it chooses on every platform.
    const QString sizeChoice = texts().format(QStringLiteral("DownloadVariantAccessibleFormat"), {label});
    view->downloadVariantPopUpButton()->setAccessibleName(sizeChoice);
    view->downloadVariantPopUpButton()->setAccessibleDescription(sizeChoice);
    _setRowStatusFieldView(
        view->downloadMessageTextField(), view->downloadVariantPopUpButton(), voice, row->isSelected());
    _setRowDownloadCheckbox(view->downloadCheckbox(), voice, row->isSelected());
}

void CustomizeVoicesWindowController::_setRowStatusFieldView(
    QLabel *statusField, QComboBox *variantPopUpButton, const CZVoiceObjectPtr &voiceObject, bool isSelected)
{
    variantPopUpButton->hide();
    const qint64 status = voiceObject->downloadStatus();
    QString text;
    if (status == 4) {
        text = texts().text(QStringLiteral("DownloadStatusTextPendingItemFormat"));
    } else if (status == 3) {
        const qint64 percent = qint64(std::trunc(voiceObject->downloadPercentComplete()));
        const QString number = CZSpeechItem::displayStringForPercent(percent);
        text = texts().format(percent >= 1
                ? QStringLiteral("DownloadStatusTextInProgressWithPercentCompleteFormat")
                : QStringLiteral("DownloadStatusTextInProgressFormat"),
            {number});
    } else if (status == 2 && isSelected) {
        text = texts().text(QStringLiteral("DownloadStatusTextRequiredItemFormat"));
        const auto *downloadable = voiceObject->isDownloadable()
            ? static_cast<const DownloadableVoice *>(voiceObject.get())
            : nullptr;
        if (downloadable && !downloadable->fullSizeBundleIdentifier().isEmpty()) {
            Platform::SizeVariants::show(variantPopUpButton, voiceObject->identifier(),
                downloadable->byteSize(), downloadable->fullSizeByteSize(), downloadable->downloadFullSize());
        }
    }
    Platform::RowView::setStatusText(statusField, text);
}

void CustomizeVoicesWindowController::_setRowDownloadCheckbox(
    CZVoiceRowCheckboxButton *checkbox, const CZVoiceObjectPtr &voiceObject, bool isSelected)
{
    checkbox->setVoiceIdentifier(voiceObject->identifier());
    if (voiceObject->downloadStatus() == 1 && isSelected) {
        // The format's one argument is the size the upgrade would fetch.
        const DownloadableVoicePtr upgrade = downloadableObjectOf(voiceObject);
        const quint64 size = !upgrade
            ? 0
            : (upgrade->downloadFullSize() ? upgrade->fullSizeByteSize() : upgrade->byteSize());
        checkbox->setText(texts().format(QStringLiteral("DownloadStatusCheckboxTextUpradeItemFormat"),
            {CZSpeechItem::displayStringForByteSize(size)}));
        checkbox->setChecked(m_markedForUpgradeSet.contains(voiceObject->identifier()));
        checkbox->show();
    } else {
        checkbox->hide();
    }
}

int CustomizeVoicesWindowController::displayedRowOfVoice(const QString &identifier) const
{
    QMutexLocker locker(&m_lock);
    for (int row = 0; row < m_currentlyDisplayedVoiceRows.size(); ++row) {
        const CZVoiceObjectPtr &voice = m_currentlyDisplayedVoiceRows.at(row)->voiceObject();
        if (voice && voice->identifier() == identifier) {
            return row;
        }
    }
    return -1;
}

void CustomizeVoicesWindowController::_propagateCheckboxSelection(CZVoiceRowCheckboxButton *sender)
{
    QMutexLocker locker(&m_lock);
    const int row = displayedRowOfVoice(sender->voiceIdentifier());
    if (row < 0) {
        _updateButtonStates();
        return;
    }
    const VoiceTableRowPtr entry = m_currentlyDisplayedVoiceRows.at(row);
    const bool ticked = sender->isChecked();
    entry->setSelected(ticked);
    const CZVoiceObjectPtr voice = entry->voiceObject();
    const QString identifier = voice->identifier();
    VoiceTableCellView *view = existingViewForRow(row);
    switch (voice->downloadStatus()) {
    case 2:
        if (view) {
            _setRowStatusFieldView(
                view->downloadMessageTextField(), view->downloadVariantPopUpButton(), voice, ticked);
        }
        break;
    case 1:
        if (!ticked) {
            m_markedForUpgradeSet.remove(identifier);
            if (identifier == OrinIdentifier) {
                m_markedForDeletionSet.insert(identifier); // an unticked Orin with an upgrade goes
            }
        } else if (const auto downloadable = downloadableObjectOf(voice); !downloadable
                   || !manager().isAutoDownloadProhibitedForDownloadableVoiceObject(*downloadable)) {
            m_markedForUpgradeSet.insert(identifier);
        }
        if (view) {
            _setRowDownloadCheckbox(view->downloadCheckbox(), voice, ticked);
        }
        break;
    case 0:
        if (ticked) {
            m_markedForDeletionSet.remove(identifier);
        } else if (manager().bundleForRemovableVoice(*voice, nullptr)) {
            m_markedForDeletionSet.insert(identifier); // voices that cannot be removed are only hidden
        }
        if (view) {
            _setRowDownloadCheckbox(view->downloadCheckbox(), voice, ticked);
        }
        break;
    default:
        break;
    }
    m_model->refreshVoiceRow(row);
    m_voiceSelectionTableView->setFocus();
    m_voiceSelectionTableView->selectRow(row);
    m_okButton->setEnabled(true);
    _updateButtonStates();
}

void CustomizeVoicesWindowController::_propagateDownloadCheckboxSelection(CZVoiceRowCheckboxButton *sender)
{
    QMutexLocker locker(&m_lock);
    const int row = displayedRowOfVoice(sender->voiceIdentifier());
    if (row >= 0) {
        const CZVoiceObjectPtr voice = m_currentlyDisplayedVoiceRows.at(row)->voiceObject();
        const bool checked = sender->isChecked();
        if (checked) {
            m_markedForUpgradeSet.insert(voice->identifier());
            m_okButton->setEnabled(true);
        } else {
            m_markedForUpgradeSet.remove(voice->identifier());
        }
        // A declined upgrade is remembered and no longer ticked in advance.
        if (const auto downloadable = downloadableObjectOf(voice)) {
            manager().markDownloadableVoiceObject(*downloadable, !checked);
        }
    }
    _updateButtonStates();
}

void CustomizeVoicesWindowController::_propagateDownloadVariantSelection(QComboBox *sender, int index)
{
    QMutexLocker locker(&m_lock);
    const QString identifier = Platform::SizeVariants::identifier(sender, index);
    const int row = displayedRowOfVoice(identifier);
    if (row >= 0) {
        const CZVoiceObjectPtr voice = m_currentlyDisplayedVoiceRows.at(row)->voiceObject();
        if (voice->isDownloadable()) {
            std::static_pointer_cast<DownloadableVoice>(voice)->setDownloadFullSize(
                Platform::SizeVariants::isFullSize(sender, index));
        }
        sender->setCurrentIndex(index);
        m_okButton->setEnabled(true);
    }
    _updateButtonStates();
}

void CustomizeVoicesWindowController::_updateButtonStates()
{
    quint64 total = 0;
    {
        QMutexLocker locker(&m_lock);
        for (const VoiceTableRowPtr &row : std::as_const(m_currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow() || !row->isSelected()) {
                continue;
            }
            const CZVoiceObjectPtr &voice = row->voiceObject();
            const qint64 status = voice->downloadStatus();
            if (status != 2 && !(status == 1 && m_markedForUpgradeSet.contains(voice->identifier()))) {
                continue;
            }
            if (voice->isDownloadable()) {
                const auto *downloadable = static_cast<const DownloadableVoice *>(voice.get());
                total += downloadable->downloadFullSize() ? downloadable->fullSizeByteSize()
                                                          : downloadable->byteSize();
            }
        }
    }
    m_playStopButton->setEnabled(_isSampleAvailableForVoiceObject(_voiceObjectForCurrentlySelectedRow()));
    m_selectedDownloadSizeTextField->setText(total == 0
            ? QString()
            : texts().format(QStringLiteral("SelectedDownloadSizeFormat"),
                {CZSpeechItem::displayStringForByteSize(total)}));
}

bool CustomizeVoicesWindowController::_isSampleAvailableForVoiceObject(
    const CZVoiceObjectPtr &voiceObject) const
{
    if (!voiceObject) {
        return false;
    }
    if (voiceObject->isDownloadable()) {
        return QFile::exists(samplePathForVoiceIdentifier(voiceObject->identifier()));
    }
    return true;
}

CZVoiceObjectPtr CustomizeVoicesWindowController::_voiceObjectForCurrentlySelectedRow()
{
    QMutexLocker locker(&m_lock);
    const QModelIndexList selected = m_voiceSelectionTableView->selectionModel()->selectedRows();
    if (selected.isEmpty()) {
        return nullptr;
    }
    const int row = selected.first().row();
    if (row < 0 || row >= m_currentlyDisplayedVoiceRows.size()) {
        return nullptr;
    }
    return m_currentlyDisplayedVoiceRows.at(row)->voiceObject();
}

bool CustomizeVoicesWindowController::_anyVoicePlaying() const
{
    const bool soundPlaying = m_sound && m_sound->isActive();
    return soundPlaying || (m_synthesizer && m_synthesizer->isSpeaking());
}

void CustomizeVoicesWindowController::_stopAndResetAllVoicePlaying()
{
    if (m_sound) {
        m_sound->disconnect(this);
        m_sound->stop();
        m_sound = nullptr;
    }
    if (m_synthesizer) {
        m_synthesizer->disconnect(this);
        m_synthesizer->stopSpeaking();
        m_synthesizer.reset();
    }
}

void CustomizeVoicesWindowController::_showPlayStopButtonAsPlaying(bool playing)
{
    m_playStopButton->setText(
        texts().text(playing ? QStringLiteral("StopButtonName") : QStringLiteral("PlayButtonName")));
}

void CustomizeVoicesWindowController::startStopPlayingSelection()
{
    const bool wasPlaying = _anyVoicePlaying();
    _stopAndResetAllVoicePlaying();
    if (wasPlaying) {
        _showPlayStopButtonAsPlaying(false);
        return;
    }
    const CZVoiceObjectPtr voice = _voiceObjectForCurrentlySelectedRow();
    if (!voice) {
        _showPlayStopButtonAsPlaying(false);
        return;
    }
    bool started = false;
    if (voice->isDownloadable()) {
        QFile sample(samplePathForVoiceIdentifier(voice->identifier()));
        if (!sample.open(QIODevice::ReadOnly)) {
            Platform::Alert::beep();
            return;
        }
        // Loaded into memory, not played by reference. The sound service answers later: the button
        // shows Stop once the sample is audible; one that cannot play beeps and leaves it on Play.
        m_sound = &Platform::Services::sound();
        connect(
            m_sound, &Platform::SoundService::started, this, [this] { _showPlayStopButtonAsPlaying(true); });
        connect(m_sound, &Platform::SoundService::finished, this,
            &CustomizeVoicesWindowController::soundDidFinishPlaying);
        connect(m_sound, &Platform::SoundService::failed, this, [this] {
            Platform::Alert::beep();
            soundDidFinishPlaying();
        });
        m_sound->play(sample.readAll(), QStringLiteral("sample.m4a"));
    } else {
        m_synthesizer = SpeechSynthesizer::initWithVoice(voice->identifier());
        if (m_synthesizer) {
            connect(m_synthesizer.get(), &SpeechSynthesizer::didFinishSpeaking, this,
                &CustomizeVoicesWindowController::speechSynthesizerDidFinishSpeaking);
            started = m_synthesizer->startSpeakingString(
                voice->voiceAttributes().value(Platform::VoiceAttribute::DemoText).toString());
        }
    }
    _showPlayStopButtonAsPlaying(started);
}

void CustomizeVoicesWindowController::soundDidFinishPlaying()
{
    QTimer::singleShot(0, this, [this] {
        if (!_anyVoicePlaying()) {
            _showPlayStopButtonAsPlaying(false);
        }
    });
}

void CustomizeVoicesWindowController::speechSynthesizerDidFinishSpeaking()
{
    if (!_anyVoicePlaying()) {
        _showPlayStopButtonAsPlaying(false);
    }
}

void CustomizeVoicesWindowController::tableViewSelectionDidChange()
{
    if (_anyVoicePlaying()) {
        _stopAndResetAllVoicePlaying();
        startStopPlayingSelection();
    }
    _updateButtonStates();
}

void CustomizeVoicesWindowController::_updateRowDownloadStatus()
{
    const QVariantList records = manager().activeVoiceInstallations();
    QMutexLocker locker(&m_lock);
    for (const QVariant &entry : records) {
        const QVariantMap record = entry.toMap();
        // The record may name the full-size voice being fetched rather than the row's own.
        int row = -1;
        auto match = CZSpeechInstallationManager::RecordMatch::None;
        for (int candidate = 0; candidate < m_currentlyDisplayedVoiceRows.size() && row < 0; ++candidate) {
            const CZVoiceObjectPtr &voice = m_currentlyDisplayedVoiceRows.at(candidate)->voiceObject();
            if (voice) {
                match = CZSpeechInstallationManager::installationRecordMatch(record, *voice);
                row = match == CZSpeechInstallationManager::RecordMatch::None ? -1 : candidate;
            }
        }
        if (row < 0) {
            continue;
        }
        const VoiceTableRowPtr &displayed = m_currentlyDisplayedVoiceRows.at(row);
        const CZVoiceObjectPtr &voice = displayed->voiceObject();
        if (match == CZSpeechInstallationManager::RecordMatch::FullSize) {
            std::static_pointer_cast<DownloadableVoice>(voice)->setDownloadFullSize(true);
        }
        voice->setDownloadStatus(record.value(InstallerProtocol::ItemDownloadStatusKey).toLongLong());
        voice->setDownloadPercentComplete(record.value(InstallerProtocol::ItemPercentCompleteKey).toDouble());
        if (VoiceTableCellView *view = existingViewForRow(row)) {
            _setRowStatusFieldView(view->downloadMessageTextField(), view->downloadVariantPopUpButton(),
                voice, displayed->isSelected());
        }
    }
}

void CustomizeVoicesWindowController::_delayedPopUpUpdate()
{
    Platform::Services::notifications().postNotification(DefaultVoiceChangedNotification);
}

void CustomizeVoicesWindowController::commitAcceptedSelection(const QList<DownloadableVoicePtr> &toInstall)
{
    stopObservingInstallations();
    {
        const QSignalBlocker blocker(m_searchField);
        m_searchField->clear();
    }
    _updateDisplayedVoicesUsingFilterString(QString());
    close();
    endSheet(true);
    if (!toInstall.isEmpty()) {
        (void)manager().startInstallingDownloadableVoices(toInstall, !m_showIndividualVoiceQualities, 0);
    }
    QTimer::singleShot(2000, this, &CustomizeVoicesWindowController::_delayedPopUpUpdate);
}

void CustomizeVoicesWindowController::acceptVoiceSelection()
{
    _stopAndResetAllVoicePlaying();
    _showPlayStopButtonAsPlaying(false);

    QList<DownloadableVoicePtr> toInstall;
    QList<RemovableSpeechItem> toRemove;
    bool removesDefault = false;
    {
        QMutexLocker locker(&m_lock);
        QVariantMap table = CZVoiceObject::visibleVoicesTable().value_or(QVariantMap());
        bool written = false;
        for (const VoiceTableRowPtr &row : std::as_const(m_currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow()) {
                continue;
            }
            const CZVoiceObjectPtr &voice = row->voiceObject();
            QStringList identifiers {voice->identifier()};
            // A voice fetched at full size installs its full-size voice: the tick follows it there.
            if (const auto *downloadable
                = voice->isDownloadable() ? static_cast<const DownloadableVoice *>(voice.get()) : nullptr;
                downloadable && row->isSelected() && downloadable->downloadFullSize()
                && !downloadable->fullSizeBundleIdentifier().isEmpty()
                && downloadable->fullSizeBundleIdentifier() != voice->identifier()) {
                identifiers.append(downloadable->fullSizeBundleIdentifier());
            }
            for (const QString &identifier : std::as_const(identifiers)) {
                const auto entry = table.constFind(identifier);
                // A missing entry counts as 0, so every shown voice ends up with one.
                if (entry == table.constEnd() || entry->toLongLong() != voice->visibility()) {
                    table.insert(identifier, voice->visibility());
                    written = true;
                }
            }
        }
        if (written) {
            CZVoiceObject::setVisibleVoicesTable(table);
        }

        const QString defaultVoice = SpeechSynthesizer::defaultVoiceFromMainstreamVoices();
        for (const VoiceTableRowPtr &row : std::as_const(m_currentlyDisplayedVoiceRows)) {
            if (row->isGroupRow()) {
                continue;
            }
            const CZVoiceObjectPtr &voice = row->voiceObject();
            const qint64 status = voice->downloadStatus();
            const QString identifier = voice->identifier();
            if (row->isSelected()
                && (status == 2 || (status == 1 && m_markedForUpgradeSet.contains(identifier)))) {
                if (const auto downloadable = downloadableObjectOf(voice)) {
                    toInstall.append(downloadable);
                }
            } else if (!row->isSelected() && (status == 0 || (status == 1 && identifier == OrinIdentifier))
                && m_markedForDeletionSet.contains(identifier)) {
                toRemove.append(voice);
                if (!defaultVoice.isEmpty() && identifier.startsWith(defaultVoice)) {
                    removesDefault = true;
                }
            }
        }
    }

    if (toRemove.isEmpty()) {
        commitAcceptedSelection(toInstall);
        return;
    }
    Platform::AlertRequest alert;
    alert.icon = QIcon::fromTheme(QStringLiteral("preferences-desktop-text-to-speech"),
        m_window->style()->standardIcon(QStyle::SP_MessageBoxWarning));
    alert.title = texts().text(QStringLiteral("DeleteDisabledVoiceAlertTitleText"));
    alert.buttons = {texts().text(QStringLiteral("DeleteDisabledItemAlertDeleteButtonText")),
        texts().text(QStringLiteral("Cancel")),
        texts().text(QStringLiteral("DeleteDisabledItemAlertKeepButtonText"))};
    Platform::Alert::beginSheet(alert, m_window, [this, toInstall, toRemove, removesDefault](int answer) {
        if (answer == 0) {
            manager().startRemovingDownloadedSpeechItems(toRemove);
            if (removesDefault) {
                Platform::PreferencesStore &preferences = Platform::Services::preferences();
                for (const char *key : {"SelectedVoiceCreator", "SelectedVoiceID", "SelectedVoiceName"}) {
                    preferences.setValue(QLatin1String(key), QVariant(), VoicePreferencesDomain);
                }
                (void)preferences.synchronize(VoicePreferencesDomain);
            }
            commitAcceptedSelection(toInstall);
        } else if (answer == 2) {
            commitAcceptedSelection(toInstall);
        }
        // Cancel: the sheet stays open with every choice as it was.
    });
}

void CustomizeVoicesWindowController::cancelVoiceSelection()
{
    _stopAndResetAllVoicePlaying();
    _showPlayStopButtonAsPlaying(false);
    stopObservingInstallations();
    close();
    endSheet(false);
}

} // namespace Cadenza
