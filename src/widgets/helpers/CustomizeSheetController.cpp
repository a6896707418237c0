// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CustomizeSheetController.h"

#include "CustomizeSheetController_p.h"
#include "cadenza_logging.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/Alert.h"
#include "widgets/helpers/GroupedRowsModel.h"
#include "widgets/helpers/VisibleRowViews.h"

#include <QDialog>
#include <QHeaderView>
#include <QIcon>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QStyle>
#include <QTableView>
#include <QTimer>
#include <QToolButton>

#include <cmath>

namespace Cadenza {

namespace {
namespace Protocol = InstallerProtocol;
constexpr int StatusPollMilliseconds = 2000;

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}
} // namespace

CustomizeSheetControllerPrivate::CustomizeSheetControllerPrivate(CustomizeSheetController *q)
    : q_ptr(q)
    , window(new QDialog)
{ }

CustomizeSheetControllerPrivate::~CustomizeSheetControllerPrivate()
{
    delete rowViews; // before the table it works on
    delete window;
}

void CustomizeSheetControllerPrivate::setUpForm(
    const Form &parts, const FormTexts &keys, Platform::GroupedRowsModel *rowsModel, int rowHeight)
{
    Q_Q(CustomizeSheetController);
    form = parts;
    formTexts = keys;
    model = rowsModel;
    window->setWindowTitle(texts().text(keys.title));
    form.explanationLabel->setText(texts().text(keys.explanation));
    form.searchField->setPlaceholderText(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    form.searchField->setAccessibleName(texts().text(QStringLiteral("VoiceCustomizationSearchPlaceholder")));
    // The field's clear button is a control of its own.
    for (QToolButton *clear : form.searchField->findChildren<QToolButton *>()) {
        clear->setAccessibleName(texts().text(QStringLiteral("SearchClearButtonName")));
    }
    form.noResultsFoundTextField->setText(texts().text(QStringLiteral("VoiceCustomizationNoResults")));
    form.okButton->setText(texts().text(QStringLiteral("OK")));
    form.cancelButton->setText(texts().text(QStringLiteral("Cancel")));
    form.table->setAccessibleName(texts().text(keys.table));

    model->setColumnTitle(form.table->accessibleName());
    form.table->setModel(model);
    rowViews = new Platform::VisibleRowViews(
        form.table, [this](int row, QWidget *spare) { return viewForRow(row, spare); }, q);
    // One height for all rows: the view can then place 10,000 rows without measuring them.
    form.table->verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    form.table->verticalHeader()->setDefaultSectionSize(rowHeight);

    QObject::connect(form.okButton, &QPushButton::clicked, q, [this] { accept(); });
    QObject::connect(form.cancelButton, &QPushButton::clicked, q, [this] { cancel(); });
    QObject::connect(
        form.searchField, &QLineEdit::textChanged, q, &CustomizeSheetController::searchFieldChanged);
    QObject::connect(form.table->selectionModel(), &QItemSelectionModel::selectionChanged, q,
        [this] { selectionDidChange(); });
    QObject::connect(window, &QDialog::rejected, q, [this] {
        if (window->isVisible() || downloadStatusUpdateTimer || installationObservation) {
            cancel();
        }
    });
}

void CustomizeSheetControllerPrivate::present(QWidget *parentWindow, bool poll)
{
    markedForDeletionSet.clear();
    {
        const QSignalBlocker blocker(form.searchField);
        form.searchField->clear();
    }
    form.searchField->setFocus();
    rebuild();

    delete downloadStatusUpdateTimer.data();
    if (poll) {
        downloadStatusUpdateTimer = new QTimer(q_ptr);
        downloadStatusUpdateTimer->setInterval(StatusPollMilliseconds);
        QObject::connect(
            downloadStatusUpdateTimer, &QTimer::timeout, q_ptr, [this] { _updateRowDownloadStatus(); });
        downloadStatusUpdateTimer->start();
    }
    form.selectedDownloadSizeTextField->clear();
    willPresent();
    form.table->scrollToTop();

    if (parentWindow) {
        window->setParent(parentWindow->window(), window->windowFlags());
    }
    window->setWindowModality(parentWindow ? Qt::WindowModal : Qt::ApplicationModal);
    window->show();
    rowViews->sync();

    stopObservingInstallations();
    installationObservation = QObject::connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, q_ptr, [this](const QString &name) {
            if (name == Protocol::FinishedInstallationNotification) {
                rebuild();
            }
        });
    didPresent();
    if (parentWindow) {
        parentWindow->window()->raise();
    }
}

void CustomizeSheetControllerPrivate::close()
{
    if (downloadStatusUpdateTimer) {
        downloadStatusUpdateTimer->stop();
        downloadStatusUpdateTimer->deleteLater();
        downloadStatusUpdateTimer = nullptr;
    }
    window->hide();
}

void CustomizeSheetControllerPrivate::stopObservingInstallations()
{
    QObject::disconnect(installationObservation);
    installationObservation = {};
}

void CustomizeSheetControllerPrivate::endSheet(bool accepted)
{
    Q_Q(CustomizeSheetController);
    if (window->parentWidget()) {
        // Back to a window of its own, so the client's window can go without taking the sheet along.
        window->setParent(nullptr, window->windowFlags());
    }
    Q_EMIT q->sheetEnded(accepted);
}

void CustomizeSheetControllerPrivate::commit(const std::function<void()> &afterClosing)
{
    stopObservingInstallations();
    willCommit();
    close();
    endSheet(true);
    if (afterClosing) {
        afterClosing();
    }
}

void CustomizeSheetControllerPrivate::accept()
{
    stopActivity();
    const Decision decision = decide();
    qCDebug(lcSheets, "OK on %s: %lld to install, %lld to remove, %lld visibility values stored",
        qPrintable(window->objectName()), static_cast<long long>(decision.changes.install.size()),
        static_cast<long long>(decision.changes.remove.size()),
        static_cast<long long>(decision.changes.visibility.size()));
    if (decision.changes.remove.isEmpty()) {
        commit(decision.commit);
        return;
    }
    Platform::AlertRequest alert;
    alert.icon = QIcon::fromTheme(QStringLiteral("preferences-desktop-text-to-speech"),
        window->style()->standardIcon(QStyle::SP_MessageBoxWarning));
    alert.title = texts().text(formTexts.removalAlertTitle);
    alert.buttons = {texts().text(QStringLiteral("DeleteDisabledItemAlertDeleteButtonText")),
        texts().text(QStringLiteral("Cancel")),
        texts().text(QStringLiteral("DeleteDisabledItemAlertKeepButtonText"))};
    Platform::Alert::beginSheet(alert, window, [this, decision](int answer) {
        if (answer == 0) {
            if (decision.remove) {
                decision.remove();
            }
            commit(decision.commit);
        } else if (answer == 2) {
            commit(decision.commit);
        }
        // Cancel: the sheet stays open with every choice as it was.
    });
}

void CustomizeSheetControllerPrivate::cancel()
{
    stopActivity();
    stopObservingInstallations();
    close();
    endSheet(false);
}

void CustomizeSheetControllerPrivate::_updateRowDownloadStatus()
{
    const QVariantList records = activeInstallations();
    QMutexLocker locker(&lock);
    for (const QVariant &entry : records) {
        const QVariantMap record = entry.toMap();
        if (const int row = rowOfInstallationRecord(record); row >= 0) {
            showInstallationRecord(row, record);
        }
    }
}

QString CustomizeSheetControllerPrivate::rowStatusText(
    qint64 downloadStatus, double percentComplete, bool isSelected)
{
    switch (downloadStatus) {
    case Protocol::WaitingStatus:
        return texts().text(QStringLiteral("DownloadStatusTextPendingItemFormat"));
    case Protocol::DownloadingStatus: {
        const qint64 percent = qint64(std::trunc(percentComplete));
        return texts().format(percent > 0
                ? QStringLiteral("DownloadStatusTextInProgressWithPercentCompleteFormat")
                : QStringLiteral("DownloadStatusTextInProgressFormat"),
            {CZSpeechItem::displayStringForPercent(percent)});
    }
    case Protocol::NotInstalledStatus:
        return isSelected ? texts().text(QStringLiteral("DownloadStatusTextRequiredItemFormat")) : QString();
    default:
        return QString();
    }
}

void CustomizeSheetControllerPrivate::showSelectedDownloadSize(quint64 total)
{
    form.selectedDownloadSizeTextField->setText(total == 0
            ? QString()
            : texts().format(QStringLiteral("SelectedDownloadSizeFormat"),
                {CZSpeechItem::displayStringForByteSize(total)}));
}

QWidget *CustomizeSheetControllerPrivate::existingViewForRow(int row) const
{
    return rowViews->viewForRow(row);
}

void CustomizeSheetControllerPrivate::showWhetherAnythingMatched(bool anything)
{
    form.noResultsFoundTextField->setVisible(!anything);
    // Said while the search field has the focus, so a screen reader hears that nothing matched.
    form.searchField->setAccessibleDescription(anything ? QString() : form.noResultsFoundTextField->text());
}

CustomizeSheetController::CustomizeSheetController(
    std::unique_ptr<CustomizeSheetControllerPrivate> dd, QObject *parent)
    : QObject(parent)
    , d_ptr(std::move(dd))
{ }

CustomizeSheetController::~CustomizeSheetController() = default;

QDialog *CustomizeSheetController::window() const
{
    return d_ptr->window;
}

QTableView *CustomizeSheetController::tableView() const
{
    return d_ptr->form.table;
}

QSet<QString> CustomizeSheetController::markedForDeletionSet() const
{
    return d_ptr->markedForDeletionSet;
}

void CustomizeSheetController::close()
{
    d_ptr->close();
}

bool CustomizeSheetController::isDownloadStatusPolling() const
{
    return d_ptr->downloadStatusUpdateTimer && d_ptr->downloadStatusUpdateTimer->isActive();
}

void CustomizeSheetController::searchFieldChanged()
{
    d_ptr->updateDisplayUsingFilterString(d_ptr->form.searchField->text());
}

int CustomizeSheetController::numberOfRowsInTableView() const
{
    QMutexLocker locker(&d_ptr->lock);
    return d_ptr->rowCount();
}

bool CustomizeSheetController::shouldSelectRow(int row) const
{
    QMutexLocker locker(&d_ptr->lock);
    return row >= 0 && row < d_ptr->rowCount() && !d_ptr->isGroupRow(row);
}

void CustomizeSheetController::acceptSheet()
{
    d_ptr->accept();
}

void CustomizeSheetController::cancelSheet()
{
    d_ptr->cancel();
}

} // namespace Cadenza
