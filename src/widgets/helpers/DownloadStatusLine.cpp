// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "DownloadStatusLine.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/rows/CZDownloadDisplayManager.h"
#include "core/speech-items/CZSpeechItem.h"
#include "protocol/InstallerProtocol.h"

#include <QAccessible>
#include <QComboBox>
#include <QLabel>
#include <QProgressBar>
#include <QTimer>

namespace Cadenza {

namespace {
namespace Protocol = InstallerProtocol;
constexpr int RefreshMilliseconds = 500;

QString tagOf(const QVariantMap &record)
{
    return record.value(Protocol::TagNameKey).toString();
}
} // namespace

DownloadStatusLine::DownloadStatusLine(Style style, QComboBox *popUp)
    : QObject(popUp)
    , m_style(std::move(style))
    , m_popUp(popUp)
    , m_displayManager(std::make_unique<CZDownloadDisplayManager>())
{ }

DownloadStatusLine::~DownloadStatusLine() = default;

void DownloadStatusLine::setTextField(QLabel *textField)
{
    m_textField = textField;
}

void DownloadStatusLine::setProgressIndicator(QProgressBar *indicator, const QString &accessibleName)
{
    m_progressIndicator = indicator;
    if (indicator) {
        indicator->setRange(0, 0); // busy, not a fraction
        indicator->setTextVisible(false);
        if (indicator->accessibleName().isEmpty()) {
            indicator->setAccessibleName(accessibleName);
        }
        indicator->hide();
    }
}

QString DownloadStatusLine::statusForActiveDownloads()
{
    const QVariantList records = CZSpeechInstallationManager::sharedManager()->activeInstallations();
    const QVariantMap first = records.isEmpty() ? QVariantMap() : records.first().toMap();
    const QString &prefix = m_style.tagPrefix;
    const bool anyOfKind = std::any_of(records.cbegin(), records.cend(),
        [&prefix](const QVariant &record) { return tagOf(record.toMap()).startsWith(prefix); });
    const double remaining = m_displayManager->timeRemainingForActiveInstallations(records, prefix);

    const Platform::LocalizationTable &texts = Platform::LocalizationTable::shared();
    QString line;
    if (tagOf(first).startsWith(prefix)) {
        const QString timeLeft = first.value(Protocol::ItemSecondsRemainingKey).toDouble() > 0
            ? CZSpeechItem::displayStringForTimeRemaining(remaining)
            : QString();
        const QString name = m_style.itemName ? m_style.itemName(records, first)
                                              : first.value(Protocol::ItemNameKey).toString();
        switch (first.value(Protocol::ItemSoftwareUpdateStateKey).toLongLong()) {
        case Protocol::InstallingState:
            line = m_style.join(
                texts.format(QStringLiteral("DownloadingStatusStringInstallingItem"), {name}), timeLeft);
            if (m_style.installing) {
                m_style.installing();
            }
            break;
        case Protocol::DownloadingState:
            line = m_style.join(
                texts.format(QStringLiteral("DownloadingStatusStringDownloadingItem"), {name}), timeLeft);
            break;
        default:
            line = texts.text(QStringLiteral("DownloadingStatusStringPreparing"));
            break;
        }
    } else if (anyOfKind) {
        line = texts.text(QStringLiteral("DownloadingStatusStringWaiting"));
    } else if (m_style.idleLine) {
        line = m_style.idleLine();
    }

    if (m_refreshTimer && line.isNull()) {
        stopRefreshing();
        m_displayManager->reset();
    } else if (!m_refreshTimer && !line.isNull()) {
        m_refreshTimer = new QTimer(this);
        m_refreshTimer->setInterval(RefreshMilliseconds);
        connect(m_refreshTimer, &QTimer::timeout, this, &DownloadStatusLine::update);
        m_refreshTimer->start();
    }
    return line;
}

void DownloadStatusLine::update()
{
    const QString line = statusForActiveDownloads();
    const QString shown = line.isNull() ? QString() : line;
    if (m_textField && m_textField->text() != shown) {
        m_textField->setText(shown);
        QAccessibleEvent event(m_textField, QAccessible::NameChanged);
        QAccessible::updateAccessibility(&event);
    }
    if (m_popUp->accessibleDescription() != shown) {
        m_popUp->setAccessibleDescription(shown); // tells assistive technology itself
    }
    if (m_progressIndicator) {
        m_progressIndicator->setVisible(!line.isNull());
    }
}

void DownloadStatusLine::stopRefreshing()
{
    if (m_refreshTimer) {
        m_refreshTimer->stop();
        m_refreshTimer->deleteLater();
        m_refreshTimer = nullptr;
    }
}

} // namespace Cadenza
