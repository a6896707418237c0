// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZCustomizeSRLanguagesWindowController.h"

#include "CZCustomizeSRLanguagesWindowController_p.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/RowView.h"
#include "widgets/helpers/SizeVariants.h"
#include "widgets/recognition-languages/CZSRLanguageRowCheckboxButton.h"
#include "widgets/recognition-languages/CZSRLanguageRowTextView.h"
#include "widgets/recognition-languages/CZSRLanguageTableCellView.h"
#include "widgets/recognition-languages/SRLanguageSelectionModel.h"

#include "ui_SRLanguageCustomization.h"

#include <QComboBox>
#include <QDialog>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTableView>

namespace Cadenza {

namespace {
namespace Protocol = InstallerProtocol;
const QString DoCancelListeningNotification = QStringLiteral("DictationIMObservationDoCancelListening");

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

CZSpeechInstallationManager &manager()
{
    return *CZSpeechInstallationManager::sharedManager();
}
} // namespace

CZCustomizeSRLanguagesWindowControllerPrivate::CZCustomizeSRLanguagesWindowControllerPrivate(
    CZCustomizeSRLanguagesWindowController *q)
    : CustomizeSheetControllerPrivate(q)
{ }

CZCustomizeSRLanguagesWindowControllerPrivate::~CZCustomizeSRLanguagesWindowControllerPrivate() = default;

CZCustomizeSRLanguagesWindowController::CZCustomizeSRLanguagesWindowController(QObject *parent)
    : CustomizeSheetController(std::make_unique<CZCustomizeSRLanguagesWindowControllerPrivate>(this), parent)
{
    Q_D(CZCustomizeSRLanguagesWindowController);
    Ui::SRLanguageCustomization ui;
    ui.setupUi(d->window);
    d->languageModel = new SRLanguageSelectionModel(this);
    d->setUpForm({ui.selectionTableView, ui.okButton, ui.cancelButton, ui.searchField,
                     ui.selectedDownloadSizeTextField, ui.noResultsFoundTextField, ui.explanationLabel},
        {QStringLiteral("SRLanguageCustomizationTitle"), QStringLiteral("SRLanguageCustomizationExplanation"),
            QStringLiteral("SRLanguageCustomizationTable"),
            QStringLiteral("DeleteDisabledLanguageAlertTitleText")},
        d->languageModel, CZSRLanguageTableCellView().sizeHint().height());
}

CZCustomizeSRLanguagesWindowController::~CZCustomizeSRLanguagesWindowController() = default;

QList<CZSRLanguageRowPtr> CZCustomizeSRLanguagesWindowController::currentlyDisplayedRows()
{
    Q_D(CZCustomizeSRLanguagesWindowController);
    QMutexLocker locker(&d->lock);
    return d->currentlyDisplayedRows;
}

void CZCustomizeSRLanguagesWindowController::showSheetForWindow(QWidget *window,
    const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
    const QString &requiredLocaleIdentifier, bool supportDownloads)
{
    Q_D(CZCustomizeSRLanguagesWindowController);
    d->networkBasedLocaleIdentifiers = networkSupportedLocaleIdentifiers;
    d->requiredLocaleIdentifier = requiredLocaleIdentifier;
    d->supportDownloads = supportDownloads;
    d->present(window, supportDownloads);
}

void CZCustomizeSRLanguagesWindowControllerPrivate::_rebuildList()
{
    QList<CZSRLanguageItemPtr> downloadables = manager().downloadableSRLanguageItems();
    auto markOfflineOnly = [this](const CZSRLanguageItemPtr &item) {
        item->setOfflineDictationOnly(networkBasedLocaleIdentifiers
            && !CZSpeechItem::isLocaleIdentifier(item->localeIdentifier(), *networkBasedLocaleIdentifiers));
    };
    for (const CZSRLanguageItemPtr &item : std::as_const(downloadables)) {
        markOfflineOnly(item);
    }
    QList<CZSRLanguageItemPtr> items;
    for (const CZSRLanguageItemPtr &installed : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
        const QList<CZSRLanguageItemPtr> candidates = downloadables;
        if (const CZSpeechItemPtr upgrade
            = manager().downloadableSpeechItemUpgradeForExistingSpeechItem(installed, candidates)) {
            installed->setDownloadStatus(Protocol::UpgradeAvailableStatus);
            downloadables.removeIf([&](const CZSRLanguageItemPtr &item) { return item == upgrade; });
        }
        markOfflineOnly(installed);
        items.append(installed);
    }
    items.append(downloadables);
    if (!requiredLocaleIdentifier.isEmpty()) {
        for (const CZSRLanguageItemPtr &item : std::as_const(items)) {
            if (CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), requiredLocaleIdentifier)) {
                item->setVisibility(1); // the pop-up's language stays listed
                break;
            }
        }
    }
    allObjects = items;
    _updateDisplayUsingFilterString(form.searchField->text());
}

void CZCustomizeSRLanguagesWindowControllerPrivate::_updateDisplayUsingFilterString(const QString &filter)
{
    const bool languageCodeOnly = std::none_of(allObjects.cbegin(), allObjects.cend(),
        [](const CZSRLanguageItemPtr &item) { return item->doesMatchSystemLocale(); });
    QMutexLocker locker(&lock);
    QList<CZSRLanguageItemPtr> shown;
    for (const CZSRLanguageItemPtr &item : std::as_const(allObjects)) {
        if (filter.isEmpty() || item->matchesSearchString(filter)) {
            shown.append(item);
        }
    }
    currentlyDisplayedRows
        = CZSRLanguageRow::arrangedRowsFromSRLanguageItems(shown, true, languageCodeOnly, true);
    languageModel->setRows(currentlyDisplayedRows);
    showWhetherAnythingMatched(!currentlyDisplayedRows.isEmpty());
}

CZSRLanguageTableCellView *CZCustomizeSRLanguagesWindowController::existingViewForRow(int row) const
{
    Q_D(const CZCustomizeSRLanguagesWindowController);
    return qobject_cast<CZSRLanguageTableCellView *>(d->existingViewForRow(row));
}

CZSRLanguageTableCellView *CZCustomizeSRLanguagesWindowController::viewForRow(
    int row, CZSRLanguageTableCellView *spare)
{
    Q_D(CZCustomizeSRLanguagesWindowController);
    return static_cast<CZSRLanguageTableCellView *>(d->viewForRow(row, spare));
}

QWidget *CZCustomizeSRLanguagesWindowControllerPrivate::viewForRow(int row, QWidget *spare)
{
    Q_Q(CZCustomizeSRLanguagesWindowController);
    QMutexLocker locker(&lock);
    if (row < 0 || row >= currentlyDisplayedRows.size() || currentlyDisplayedRows.at(row)->isGroupRow()) {
        return nullptr; // headings are drawn by the table itself
    }
    const CZSRLanguageRowPtr &entry = currentlyDisplayedRows.at(row);
    const CZSRLanguageItemPtr item = entry->srLanguageItem();
    auto *view = qobject_cast<CZSRLanguageTableCellView *>(spare);
    if (!view) {
        view = new CZSRLanguageTableCellView;
        QObject::connect(view->activeCheckbox(), &QAbstractButton::clicked, q,
            [this, box = view->activeCheckbox()] { _propagateCheckboxSelection(box); });
        QObject::connect(view->downloadVariantPopUpButton(), &QComboBox::activated, q,
            [this, sizes = view->downloadVariantPopUpButton()](
                int index) { _propagateDownloadVariantSelection(sizes, index); });
    }
    const qint64 status = item->downloadStatus();
    const bool fetching = status == Protocol::DownloadingStatus || status == Protocol::WaitingStatus;
    const bool greyed = supportDownloads ? fetching : item->offlineDictationOnly();
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

void CZCustomizeSRLanguagesWindowControllerPrivate::_setRowStatusFieldView(QLabel *statusField,
    QComboBox *variantPopUpButton, const CZSRLanguageItemPtr &speechItem, bool isSelected)
{
    variantPopUpButton->hide();
    if (!supportDownloads) {
        const bool offlineOnly = speechItem->offlineDictationOnly();
        statusField->setVisible(offlineOnly);
        statusField->setText(
            offlineOnly ? texts().text(QStringLiteral("DownloadStatusTextOfflineDictationOnly")) : QString());
        return;
    }
    const qint64 status = speechItem->downloadStatus();
    if (status == Protocol::NotInstalledStatus && isSelected
        && !speechItem->fullSizeBundleIdentifier().isEmpty()) {
        Platform::SizeVariants::show(variantPopUpButton, speechItem->localeIdentifier(),
            speechItem->byteSize(), speechItem->fullSizeByteSize(), speechItem->downloadFullSize());
    }
    statusField->show();
    Platform::RowView::setStatusText(
        statusField, rowStatusText(status, speechItem->downloadPercentComplete(), isSelected));
}

int CZCustomizeSRLanguagesWindowControllerPrivate::displayedRowOfLocale(const QString &localeIdentifier) const
{
    QMutexLocker locker(&lock);
    for (int row = 0; row < currentlyDisplayedRows.size(); ++row) {
        const CZSRLanguageItemPtr item = currentlyDisplayedRows.at(row)->srLanguageItem();
        if (item && item->localeIdentifier() == localeIdentifier) {
            return row;
        }
    }
    return -1;
}

void CZCustomizeSRLanguagesWindowControllerPrivate::_propagateCheckboxSelection(
    CZSRLanguageRowCheckboxButton *sender)
{
    Q_Q(CZCustomizeSRLanguagesWindowController);
    {
        QMutexLocker locker(&lock);
        const int row = displayedRowOfLocale(sender->localeIdentifier());
        if (row >= 0) {
            const CZSRLanguageRowPtr entry = currentlyDisplayedRows.at(row);
            const bool ticked = sender->isChecked();
            entry->setSelected(ticked);
            const CZSRLanguageItemPtr item = entry->srLanguageItem();
            if (item->downloadStatus() == Protocol::NotInstalledStatus) {
                if (CZSRLanguageTableCellView *view = q->existingViewForRow(row)) {
                    _setRowStatusFieldView(
                        view->downloadMessageTextField(), view->downloadVariantPopUpButton(), item, ticked);
                }
            } else if (item->downloadStatus() == Protocol::InstalledStatus) {
                if (ticked) {
                    markedForDeletionSet.remove(item->localeIdentifier());
                } else if (manager().bundleForRemovableLanguage(*item, nullptr)) {
                    markedForDeletionSet.insert(item->localeIdentifier());
                }
            }
            form.table->setFocus();
            form.table->selectRow(row);
            form.okButton->setEnabled(true);
        }
    }
    _updateButtonStatesOnlyIfDownloadRequired(false);
}

void CZCustomizeSRLanguagesWindowControllerPrivate::_propagateDownloadVariantSelection(
    QComboBox *sender, int index)
{
    {
        QMutexLocker locker(&lock);
        const int row = displayedRowOfLocale(Platform::SizeVariants::identifier(sender, index));
        if (row >= 0) {
            currentlyDisplayedRows.at(row)->srLanguageItem()->setDownloadFullSize(
                sender->itemData(index).toInt() > 0);
            sender->setCurrentIndex(index);
            form.table->setFocus();
            form.table->selectRow(row);
            form.okButton->setEnabled(true);
        }
    }
    _updateButtonStatesOnlyIfDownloadRequired(false);
}

void CZCustomizeSRLanguagesWindowControllerPrivate::_updateButtonStatesOnlyIfDownloadRequired(
    bool onlyIfDownloadRequired)
{
    quint64 total = 0;
    bool downloadRequired = false;
    {
        QMutexLocker locker(&lock);
        for (const CZSRLanguageRowPtr &row : std::as_const(currentlyDisplayedRows)) {
            const CZSRLanguageItemPtr item = row->srLanguageItem();
            if (row->isGroupRow() || !item || !row->isSelected()
                || item->downloadStatus() != Protocol::NotInstalledStatus) {
                continue;
            }
            downloadRequired = true;
            total += item->downloadFullSize() ? item->fullSizeByteSize() : item->byteSize();
        }
    }
    if (onlyIfDownloadRequired && downloadRequired) {
        form.okButton->setEnabled(true); // never disabled here
    }
    showSelectedDownloadSize(supportDownloads ? total : 0);
}

QVariantList CZCustomizeSRLanguagesWindowControllerPrivate::activeInstallations() const
{
    return manager().activeInstallations();
}

int CZCustomizeSRLanguagesWindowControllerPrivate::rowOfInstallationRecord(const QVariantMap &record)
{
    const QString objectIdentifier = record.value(Protocol::ObjectIDKey).toString();
    for (int row = 0; row < currentlyDisplayedRows.size(); ++row) {
        const CZSRLanguageItemPtr item = currentlyDisplayedRows.at(row)->srLanguageItem();
        if (item && CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), objectIdentifier)) {
            return row;
        }
    }
    return -1;
}

void CZCustomizeSRLanguagesWindowControllerPrivate::showInstallationRecord(int row, const QVariantMap &record)
{
    Q_Q(CZCustomizeSRLanguagesWindowController);
    const CZSRLanguageRowPtr &displayed = currentlyDisplayedRows.at(row);
    const CZSRLanguageItemPtr item = displayed->srLanguageItem();
    item->setDownloadStatus(record.value(Protocol::ItemDownloadStatusKey).toLongLong());
    item->setDownloadPercentComplete(record.value(Protocol::ItemPercentCompleteKey).toDouble());
    if (CZSRLanguageTableCellView *view = q->existingViewForRow(row)) {
        _setRowStatusFieldView(view->downloadMessageTextField(), view->downloadVariantPopUpButton(), item,
            displayed->isSelected());
    }
}

CustomizeSheetControllerPrivate::Decision CZCustomizeSRLanguagesWindowControllerPrivate::decide()
{
    QMutexLocker locker(&lock);
    // Only the rows on display are saved: ticks on rows the filter hides are not written.
    QList<CZSRLanguageItemPtr> items;
    QList<SelectionRow> rows;
    for (const CZSRLanguageRowPtr &row : std::as_const(currentlyDisplayedRows)) {
        const CZSRLanguageItemPtr item = row->srLanguageItem();
        if (row->isGroupRow() || !item) {
            continue;
        }
        SelectionRow entry;
        entry.identifier = item->localeIdentifier();
        entry.visibility = item->visibility();
        entry.visibilityIdentifiers = {item->localeIdentifier()};
        entry.downloadStatus = item->downloadStatus();
        entry.selected = row->isSelected();
        entry.markedForDeletion = markedForDeletionSet.contains(item->localeIdentifier());
        entry.keptInstalled
            = CZSpeechItem::isSameLocaleIdentifier(item->localeIdentifier(), requiredLocaleIdentifier);
        rows.append(entry);
        items.append(item);
    }
    // Locales are compared as locales, never as strings: the table answers for any spelling.
    const auto stored = [](const QString &locale) -> std::optional<qint64> {
        return CZSRLanguageItem::visibiltyValueForLocaleIdentifier(locale, nullptr);
    };
    Decision decision;
    decision.changes = decideSelectionChanges(rows, stored, supportDownloads);
    for (auto entry = decision.changes.visibility.cbegin(); entry != decision.changes.visibility.cend();
         ++entry) {
        CZSRLanguageItem::setVisibilityValue(quint64(entry.value()), entry.key());
    }

    QList<CZSRLanguageItemPtr> toInstall;
    for (const qsizetype index : std::as_const(decision.changes.install)) {
        toInstall.append(items.at(index));
    }
    QList<RemovableSpeechItem> toRemove;
    for (const qsizetype index : std::as_const(decision.changes.remove)) {
        toRemove.append(items.at(index));
    }
    decision.remove = [toRemove] {
        // Dictation must let go of the language before its files go.
        Platform::Services::notifications().postNotification(DoCancelListeningNotification);
        manager().startRemovingDownloadedSpeechItems(toRemove);
    };
    decision.commit = [toInstall] {
        if (!toInstall.isEmpty()) {
            (void)manager().startInstallingDownloadableSpeechItems(toInstall, 0);
        }
    };
    return decision;
}

void CZCustomizeSRLanguagesWindowController::acceptSelection()
{
    acceptSheet();
}

void CZCustomizeSRLanguagesWindowController::cancelSelection()
{
    cancelSheet();
}

} // namespace Cadenza
