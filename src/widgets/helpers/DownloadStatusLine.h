// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_DOWNLOADSTATUSLINE_H
#define CADENZA_PLATFORM_DOWNLOADSTATUSLINE_H

#include "cadenza_export.h"

#include <QObject>
#include <QPointer>
#include <QVariantList>

#include <functional>
#include <memory>

class QComboBox;
class QLabel;
class QProgressBar;
class QTimer;

namespace Cadenza {

class CZDownloadDisplayManager;

/**
 * The download status line of a pop-up: "Downloading Femke — About 2 minutes remaining" while an item
 * of the pop-up's kind is fetched, "Installing …", "Preparing …" or "Waiting …" while one is queued,
 * nothing otherwise. While there is a line it is refreshed twice a second; the time left is smoothed
 * over the refreshes. The line goes into a text field, into the pop-up's accessible description and
 * shows a busy indicator.
 */
class CADENZA_EXPORT DownloadStatusLine : public QObject
{
    Q_OBJECT
public:
    /// What differs between the pop-ups.
    struct Style
    {
        /// The tag prefix of the pop-up's kind of item.
        QString tagPrefix;
        /// Joins the item's line and the time left into the status line.
        std::function<QString(const QString &itemLine, const QString &timeLeft)> join;
        /// The name the line gives the running item (by default its record's name).
        std::function<QString(const QVariantList &records, const QVariantMap &first)> itemName;
        /// Called on each refresh while the running item is being installed.
        std::function<void()> installing;
        /// The line when no item of the kind is queued (by default none).
        std::function<QString()> idleLine;
    };

    DownloadStatusLine(Style style, QComboBox *popUp);
    ~DownloadStatusLine() override;

    void setTextField(QLabel *textField);
    /// Makes @p indicator a hidden busy indicator called @p accessibleName unless it has a name.
    void setProgressIndicator(QProgressBar *indicator, const QString &accessibleName);

    /// The line for the installer's active installations now (null: none); starts the refreshing
    /// when there is a line and stops it when there is none.
    [[nodiscard]] QString statusForActiveDownloads();
    /// Shows the line now.
    void update();
    /// Stops refreshing until the next line (an installation finished).
    void stopRefreshing();
    [[nodiscard]] bool isRefreshing() const { return m_refreshTimer != nullptr; }

private:
    Style m_style;
    QComboBox *m_popUp;
    QPointer<QLabel> m_textField;
    QPointer<QProgressBar> m_progressIndicator;
    QTimer *m_refreshTimer = nullptr;
    std::unique_ptr<CZDownloadDisplayManager> m_displayManager;
};

} // namespace Cadenza

#endif
