#include "CZCustomizeSRLanguagesWindowController.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/Alert.h"
#include "widgets/helpers/RowView.h"
#include "widgets/helpers/SizeVariants.h"
#include "widgets/helpers/VisibleRowViews.h"
#include "widgets/recognition-languages/CZSRLanguageRowCheckboxButton.h"
#include "widgets/recognition-languages/CZSRLanguageRowTextView.h"
#include "widgets/recognition-languages/CZSRLanguageTableCellView.h"
#include "widgets/recognition-languages/SRLanguageSelectionModel.h"

#include "ui_SRLanguageCustomization.h"

#include <QComboBox>
#include <QDialog>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QLocale>
#include <QPushButton>
#include <QStyle>
#include <QTableView>
#include <QTimer>
#include <QToolButton>

#include <cmath>

namespace Cadenza {

namespace {
const QString DoCancelListeningNotification = QStringLiteral("DictationIMObservationDoCancelListening");
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

CZCustomizeSRLanguagesWindowController::CZCustomizeSRLanguagesWindowController(QObject *parent)
    : QObject(parent)
    , m_window(new QDialog)
    , m_model(new SRLanguageSelectionModel(this))
{
    Ui::SRLanguageCustomization ui;
    ui.setupUi(m_window);
    m_selectionTableView = ui.selectionTableView;
    m_okButton = ui.okButton;
    m_cancelButton = ui.cancelButton;
    m_searchField = ui.searchField;
    m_selectedDownloadSizeTextField = ui.selectedDownloadSizeTextField;
    m_noResultsFoundTextField = ui.noResultsFoundTextField;

    m_window->setWindowTitle(texts().text(QStringLiteral("SRLanguageCustomizationTitle")));
    ui.explanationLabel->setText(texts().text(QStringLiteral("SRLanguageCustomizationExplanation")));
    m_searchField->setPlaceholderText(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    m_searchField->setAccessibleName(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    // The field's clear button is a control of its own.
    for (QToolButton *clear : m_searchField->findChildren<QToolButton *>()) {
        clear->setAccessibleName(texts().text(QStringLiteral("SearchClearButtonName")));
    }
    m_noResultsFoundTextField->setText(texts().text(QStringLiteral("VoiceCustomizationNoResults")));
    m_okButton->setText(texts().text(QStringLiteral("OK")));
    m_cancelButton->setText(texts().text(QStringLiteral("Cancel")));
    m_selectionTableView->setAccessibleName(texts().text(QStringLiteral("SRLanguageCustomizationTable")));

    m_model->setColumnTitle(m_selectionTableView->accessibleName());
    m_selectionTableView->setModel(m_model);
    m_selectionTableView->verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    m_selectionTableView->verticalHeader()->setDefaultSectionSize(
        CZSRLanguageTableCellView().sizeHint().height());
    m_rowViews = new Platform::VisibleRowViews(
        m_selectionTableView,
        [this](int row, QWidget *spare) -> QWidget * {
            return viewForRow(row, qobject_cast<CZSRLanguageTableCellView *>(spare));
        },
        this);

    connect(
        m_okButton, &QPushButton::clicked, this, &CZCustomizeSRLanguagesWindowController::acceptSelection);
    connect(m_cancelButton, &QPushButton::clicked, this,
        &CZCustomizeSRLanguagesWindowController::cancelSelection);
    connect(m_searchField, &QLineEdit::textChanged, this,
        &CZCustomizeSRLanguagesWindowController::searchFieldChanged);
    connect(m_selectionTableView->selectionModel(), &QItemSelectionModel::selectionChanged, this,
        [this] { _updateButtonStatesOnlyIfDownloadRequired(false); });
    connect(m_window, &QDialog::rejected, this, [this] {
        if (m_downloadStatusUpdateTimer || m_installationObservation) {
            cancelSelection();
        }
    });
}

CZCustomizeSRLanguagesWindowController::~CZCustomizeSRLanguagesWindowController()
{
    delete m_rowViews; // before the table it works on
    delete m_window;
}

QList<CZSRLanguageRowPtr> CZCustomizeSRLanguagesWindowController::currentlyDisplayedRows()
{
    QMutexLocker locker(&m_lock);
    return m_currentlyDisplayedRows;
}

bool CZCustomizeSRLanguagesWindowController::isDownloadStatusPolling() const
{
    return m_downloadStatusUpdateTimer && m_downloadStatusUpdateTimer->isActive();
}

void CZCustomizeSRLanguagesWindowController::showSheetForWindow(QWidget *window,
    const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
    const QString &requiredLocaleIdentifier, bool supportDownloads)
{
    m_networkBasedLocaleIdentifiers = networkSupportedLocaleIdentifiers;
    m_requiredLocaleIdentifier = requiredLocaleIdentifier;
    m_markedForDeletionSet.clear();
    m_supportDownloads = supportDownloads;
    {
        const QSignalBlocker blocker(m_searchField);
        m_searchField->clear();
    }
    m_searchField->setFocus();
    _rebuildList();
    delete m_downloadStatusUpdateTimer.data();
    if (supportDownloads) {
        m_downloadStatusUpdateTimer = new QTimer(this);
        m_downloadStatusUpdateTimer->setInterval(StatusPollMilliseconds);
        connect(m_downloadStatusUpdateTimer, &QTimer::timeout, this,
            &CZCustomizeSRLanguagesWindowController::_updateRowDownloadStatus);
        m_downloadStatusUpdateTimer->start();
    }
    m_selectedDownloadSizeTextField->clear();
    m_selectionTableView->scrollToTop();
    if (window) {
        m_window->setParent(window->window(), m_window->windowFlags());
    }
    m_window->setWindowModality(window ? Qt::WindowModal : Qt::ApplicationModal);
    m_window->show();
    m_rowViews->sync();
    disconnect(m_installationObservation);
    m_installationObservation = connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, this, [this](const QString &name) {
            if (name == InstallerProtocol::FinishedInstallationNotification) {
                _rebuildList();
            }
        });
    _updateButtonStatesOnlyIfDownloadRequired(true);
    if (window) {
        window->window()->raise();
    }
}

void CZCustomizeSRLanguagesWindowController::close()
{
    if (m_downloadStatusUpdateTimer) {
        m_downloadStatusUpdateTimer->stop();
        m_downloadStatusUpdateTimer->deleteLater();
        m_downloadStatusUpdateTimer = nullptr;
    }
    m_window->hide();
}

void CZCustomizeSRLanguagesWindowController::endSheet(bool accepted)
{
    if (m_window->parentWidget()) {
        // Back to a window of its own, so the client's window can go without taking the sheet along.
        m_window->setParent(nullptr, m_window->windowFlags());
    }
    Q_EMIT sheetEnded(accepted);
}

void CZCustomizeSRLanguagesWindowController::_rebuildList()
{
    QList<CZSRLanguageItemPtr> downloadables = manager().downloadableSRLanguageItems();
    auto markOfflineOnly = [this](const CZSRLanguageItemPtr &item) {
        item->setOfflineDictationOnly(m_networkBasedLocaleIdentifiers
            && !CZSpeechItem::isLocaleIdentifier(item->localeIdentifier(), *m_networkBasedLocaleIdentifiers));
    };
    for (const CZSRLanguageItemPtr &item : std::as_const(downloadables)) {
        markOfflineOnly(item);
    }
    QList<CZSRLanguageItemPtr> items;
    for (const CZSRLanguageItemPtr &installed : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
        const QList<CZSRLanguageItemPtr> candidates = downloadables;
        if (const CZSpeechItemPtr upgrade
            = manager().downloadableSpeechItemUpgradeForExistingSpeechItem(installed, candidates)) {
            installed->setDownloadStatus(1);
            downloadables.removeIf([&](const CZSRLanguageItemPtr &item) { return item == upgrade; });
        }
        markOfflineOnly(installed);
        items.append(installed);
    }
    items.append(downloadables);
    if (!m_requiredLocaleIdentifier.isEmpty()) {
        for (const CZSRLanguageItemPtr &item : std::as_const(items)) {
            if (CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), m_requiredLocaleIdentifier)) {
                item->setVisibility(1); // the pop-up's language stays listed
                break;
            }
        }
    }
    m_allObjects = items;
    _updateDisplayUsingFilterString(m_searchField->text());
}

void CZCustomizeSRLanguagesWindowController::_updateDisplayUsingFilterString(const QString &filter)
{
    const bool languageCodeOnly = std::none_of(m_allObjects.cbegin(), m_allObjects.cend(),
        [](const CZSRLanguageItemPtr &item) { return item->doesMatchSystemLocale(); });
    QMutexLocker locker(&m_lock);
    QList<CZSRLanguageItemPtr> shown;
    for (const CZSRLanguageItemPtr &item : std::as_const(m_allObjects)) {
        if (filter.isEmpty() || item->matchesSearchString(filter)) {
            shown.append(item);
        }
    }
    m_currentlyDisplayedRows
        = CZSRLanguageRow::arrangedRowsFromSRLanguageItems(shown, true, languageCodeOnly, true);
    m_model->setRows(m_currentlyDisplayedRows);
    m_noResultsFoundTextField->setVisible(m_currentlyDisplayedRows.isEmpty());
    // Said while the search field has the focus, so a screen reader hears that nothing matched.
    m_searchField->setAccessibleDescription(
        m_currentlyDisplayedRows.isEmpty() ? m_noResultsFoundTextField->text() : QString());
}

void CZCustomizeSRLanguagesWindowController::searchFieldChanged()
{
    _updateDisplayUsingFilterString(m_searchField->text());
}

int CZCustomizeSRLanguagesWindowController::numberOfRowsInTableView() const
{
    QMutexLocker locker(&m_lock);
    return int(m_currentlyDisplayedRows.size());
}

bool CZCustomizeSRLanguagesWindowController::shouldSelectRow(int row) const
{
    QMutexLocker locker(&m_lock);
    return row >= 0 && row < m_currentlyDisplayedRows.size()
        && !m_currentlyDisplayedRows.at(row)->isGroupRow();
}

CZSRLanguageTableCellView *CZCustomizeSRLanguagesWindowController::existingViewForRow(int row) const
{
    return qobject_cast<CZSRLanguageTableCellView *>(m_rowViews->viewForRow(row));
}

CZSRLanguageTableCellView *CZCustomizeSRLanguagesWindowController::viewForRow(
    int row, CZSRLanguageTableCellView *spare)
{
    QMutexLocker locker(&m_lock);
    if (row < 0 || row >= m_currentlyDisplayedRows.size() || m_currentlyDisplayedRows.at(row)->isGroupRow()) {
        return nullptr; // headings are drawn by the table itself
    }
    const CZSRLanguageRowPtr &entry = m_currentlyDisplayedRows.at(row);
    const CZSRLanguageItemPtr item = entry->srLanguageItem();
    CZSRLanguageTableCellView *view = spare;
    if (!view) {
        view = new CZSRLanguageTableCellView;
        connect(view->activeCheckbox(), &QAbstractButton::clicked, this,
            [this, box = view->activeCheckbox()] { _propagateCheckboxSelection(box); });
        connect(view->downloadVariantPopUpButton(), &QComboBox::activated, this,
            [this, sizes = view->downloadVariantPopUpButton()](
                int index) { _propagateDownloadVariantSelection(sizes, index); });
    }
    const qint64 status = item->downloadStatus();
    const bool fetching = status == 3 || status == 4;
    const bool greyed = m_supportDownloads ? fetching : item->offlineDictationOnly();
    view->textField()->setText(item->countryDisplayString());
    view->textField()->setEnabled(!greyed);
    view->activeCheckbox()->setChecked(entry->isSelected());
    view->activeCheckbox()->setEnabled(!greyed);
    view->activeCheckbox()->setLocaleIdentifier(item->localeIdentifier());
    view->activeCheckbox()->setProperty("cellIdentifier", QStringLiteral("_CADENZA_VOICE_CHECKBOX"));
    view->activeCheckbox()->setAccessibleName(SRLanguageSelectionModel::accessibleNameForItem(*item));
    // A pop-up reads its choice as its name on Linux and its label elsewhere; the description says
    // what it chooses on every platform.
    const QString sizeChoice = texts().format(QStringLiteral("DownloadVariantAccessibleFormat"),
        {SRLanguageSelectionModel::accessibleNameForItem(*item)});
    view->downloadVariantPopUpButton()->setAccessibleName(sizeChoice);
    view->downloadVariantPopUpButton()->setAccessibleDescription(sizeChoice);
    _setRowStatusFieldView(
        view->downloadMessageTextField(), view->downloadVariantPopUpButton(), item, entry->isSelected());
    return view;
}

void CZCustomizeSRLanguagesWindowController::_setRowStatusFieldView(QLabel *statusField,
    QComboBox *variantPopUpButton, const CZSRLanguageItemPtr &speechItem, bool isSelected)
{
    variantPopUpButton->hide();
    if (!m_supportDownloads) {
        const bool offlineOnly = speechItem->offlineDictationOnly();
        statusField->setVisible(offlineOnly);
        statusField->setText(
            offlineOnly ? texts().text(QStringLiteral("DownloadStatusTextOfflineDictationOnly")) : QString());
        return;
    }
    QString text;
    switch (speechItem->downloadStatus()) {
    case 4:
        text = texts().text(QStringLiteral("DownloadStatusTextPendingItemFormat"));
        break;
    case 3: {
        const qint64 percent = qint64(std::trunc(speechItem->downloadPercentComplete()));
        text = texts().format(percent > 0
                ? QStringLiteral("DownloadStatusTextInProgressWithPercentCompleteFormat")
                : QStringLiteral("DownloadStatusTextInProgressFormat"),
            {CZSpeechItem::displayStringForPercent(percent)});
        break;
    }
    case 2:
        if (isSelected) {
            text = texts().text(QStringLiteral("DownloadStatusTextRequiredItemFormat"));
            if (!speechItem->fullSizeBundleIdentifier().isEmpty()) {
                Platform::SizeVariants::show(variantPopUpButton, speechItem->localeIdentifier(),
                    speechItem->byteSize(), speechItem->fullSizeByteSize(), speechItem->downloadFullSize());
            }
        }
        break;
    default:
        break;
    }
    statusField->show();
    Platform::RowView::setStatusText(statusField, text);
}

int CZCustomizeSRLanguagesWindowController::displayedRowOfLocale(const QString &localeIdentifier) const
{
    QMutexLocker locker(&m_lock);
    for (int row = 0; row < m_currentlyDisplayedRows.size(); ++row) {
        const CZSRLanguageItemPtr item = m_currentlyDisplayedRows.at(row)->srLanguageItem();
        if (item && item->localeIdentifier() == localeIdentifier) {
            return row;
        }
    }
    return -1;
}

void CZCustomizeSRLanguagesWindowController::_propagateCheckboxSelection(
    CZSRLanguageRowCheckboxButton *sender)
{
    {
        QMutexLocker locker(&m_lock);
        const int row = displayedRowOfLocale(sender->localeIdentifier());
        if (row >= 0) {
            const CZSRLanguageRowPtr entry = m_currentlyDisplayedRows.at(row);
            const bool ticked = sender->isChecked();
            entry->setSelected(ticked);
            const CZSRLanguageItemPtr item = entry->srLanguageItem();
            if (item->downloadStatus() == 2) {
                if (CZSRLanguageTableCellView *view = existingViewForRow(row)) {
                    _setRowStatusFieldView(
                        view->downloadMessageTextField(), view->downloadVariantPopUpButton(), item, ticked);
                }
            } else if (item->downloadStatus() == 0) {
                if (ticked) {
                    m_markedForDeletionSet.remove(item->localeIdentifier());
                } else if (manager().bundleForRemovableLanguage(*item, nullptr)) {
                    m_markedForDeletionSet.insert(item->localeIdentifier());
                }
            }
            m_selectionTableView->setFocus();
            m_selectionTableView->selectRow(row);
            m_okButton->setEnabled(true);
        }
    }
    _updateButtonStatesOnlyIfDownloadRequired(false);
}

void CZCustomizeSRLanguagesWindowController::_propagateDownloadVariantSelection(QComboBox *sender, int index)
{
    {
        QMutexLocker locker(&m_lock);
        const int row = displayedRowOfLocale(Platform::SizeVariants::identifier(sender, index));
        if (row >= 0) {
            m_currentlyDisplayedRows.at(row)->srLanguageItem()->setDownloadFullSize(
                sender->itemData(index).toInt() > 0);
            sender->setCurrentIndex(index);
            m_selectionTableView->setFocus();
            m_selectionTableView->selectRow(row);
            m_okButton->setEnabled(true);
        }
    }
    _updateButtonStatesOnlyIfDownloadRequired(false);
}

void CZCustomizeSRLanguagesWindowController::_updateButtonStatesOnlyIfDownloadRequired(
    bool onlyIfDownloadRequired)
{
    quint64 total = 0;
    bool downloadRequired = false;
    {
        QMutexLocker locker(&m_lock);
        for (const CZSRLanguageRowPtr &row : std::as_const(m_currentlyDisplayedRows)) {
            const CZSRLanguageItemPtr item = row->srLanguageItem();
            if (row->isGroupRow() || !item || !row->isSelected() || item->downloadStatus() != 2) {
                continue;
            }
            downloadRequired = true;
            total += item->downloadFullSize() ? item->fullSizeByteSize() : item->byteSize();
        }
    }
    if (onlyIfDownloadRequired && downloadRequired) {
        m_okButton->setEnabled(true); // never disabled here
    }
    m_selectedDownloadSizeTextField->setText(!m_supportDownloads || total == 0
            ? QString()
            : texts().format(QStringLiteral("SelectedDownloadSizeFormat"),
                {CZSpeechItem::displayStringForByteSize(total)}));
}

void CZCustomizeSRLanguagesWindowController::_updateRowDownloadStatus()
{
    const QVariantList records = manager().activeInstallations();
    QMutexLocker locker(&m_lock);
    for (const QVariant &entry : records) {
        const QVariantMap record = entry.toMap();
        const QString objectIdentifier = record.value(InstallerProtocol::ObjectIDKey).toString();
        for (int row = 0; row < m_currentlyDisplayedRows.size(); ++row) {
            const CZSRLanguageRowPtr &displayed = m_currentlyDisplayedRows.at(row);
            const CZSRLanguageItemPtr item = displayed->srLanguageItem();
            if (!item || !CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), objectIdentifier)) {
                continue;
            }
            item->setDownloadStatus(record.value(InstallerProtocol::ItemDownloadStatusKey).toLongLong());
            item->setDownloadPercentComplete(
                record.value(InstallerProtocol::ItemPercentCompleteKey).toDouble());
            if (CZSRLanguageTableCellView *view = existingViewForRow(row)) {
                _setRowStatusFieldView(view->downloadMessageTextField(), view->downloadVariantPopUpButton(),
                    item, displayed->isSelected());
            }
            break;
        }
    }
}

void CZCustomizeSRLanguagesWindowController::finishAccepted(const QList<CZSRLanguageItemPtr> &toInstall)
{
    disconnect(m_installationObservation);
    m_installationObservation = {};
    close();
    endSheet(true);
    if (!toInstall.isEmpty()) {
        (void)manager().startInstallingDownloadableSpeechItems(toInstall, 0);
    }
}

void CZCustomizeSRLanguagesWindowController::acceptSelection()
{
    QList<CZSRLanguageItemPtr> toInstall;
    QList<RemovableSpeechItem> toRemove;
    {
        QMutexLocker locker(&m_lock);
        // Only the rows on display are saved: ticks on rows the filter hides are not written.
        for (const CZSRLanguageRowPtr &row : std::as_const(m_currentlyDisplayedRows)) {
            const CZSRLanguageItemPtr item = row->srLanguageItem();
            if (row->isGroupRow() || !item) {
                continue;
            }
            const qint64 stored
                = CZSRLanguageItem::visibiltyValueForLocaleIdentifier(item->localeIdentifier(), nullptr);
            if (stored != item->visibility()) {
                CZSRLanguageItem::setVisibilityValue(quint64(item->visibility()), item->localeIdentifier());
            }
        }
        if (m_supportDownloads) {
            for (const CZSRLanguageRowPtr &row : std::as_const(m_currentlyDisplayedRows)) {
                const CZSRLanguageItemPtr item = row->srLanguageItem();
                if (row->isGroupRow() || !item) {
                    continue;
                }
                if (row->isSelected() && item->downloadStatus() == 2) {
                    toInstall.append(item);
                } else if (!row->isSelected() && item->downloadStatus() == 0
                    && m_markedForDeletionSet.contains(item->localeIdentifier())
                    && !CZSpeechItem::isSameLocaleIdentifier(
                        item->localeIdentifier(), m_requiredLocaleIdentifier)) {
                    toRemove.append(item);
                }
            }
        }
    }
    if (toRemove.isEmpty()) {
        finishAccepted(toInstall);
        return;
    }
    Platform::AlertRequest alert;
    alert.icon = QIcon::fromTheme(QStringLiteral("preferences-desktop-text-to-speech"),
        m_window->style()->standardIcon(QStyle::SP_MessageBoxWarning));
    alert.title = texts().text(QStringLiteral("DeleteDisabledLanguageAlertTitleText"));
    alert.buttons = {texts().text(QStringLiteral("DeleteDisabledItemAlertDeleteButtonText")),
        texts().text(QStringLiteral("Cancel")),
        texts().text(QStringLiteral("DeleteDisabledItemAlertKeepButtonText"))};
    Platform::Alert::beginSheet(alert, m_window, [this, toInstall, toRemove](int answer) {
        if (answer == 0) {
            // Dictation must let go of the language before its files go.
            Platform::Services::notifications().postNotification(DoCancelListeningNotification);
            manager().startRemovingDownloadedSpeechItems(toRemove);
            finishAccepted(toInstall);
        } else if (answer == 2) {
            finishAccepted(toInstall);
        }
    });
}

void CZCustomizeSRLanguagesWindowController::cancelSelection()
{
    disconnect(m_installationObservation);
    m_installationObservation = {};
    close();
    endSheet(false);
}

} // namespace Cadenza
