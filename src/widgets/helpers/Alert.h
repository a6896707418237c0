// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ALERT_H
#define CADENZA_PLATFORM_ALERT_H

#include "cadenza_export.h"

#include <QIcon>
#include <QStringList>

#include <functional>

class QWidget;

namespace Cadenza::Platform {

/// What an alert says and offers; the first button is the default.
struct CADENZA_EXPORT AlertRequest
{
    QString title;
    QString message;
    QStringList buttons;
    QIcon icon;
    bool asSheet = false; ///< shown window-modal on a parent window rather than application-modal
};

/**
 * Alerts, as message boxes. Tests install a responder that answers instead of a user; without one the
 * alert is shown. Answers are the index of the chosen button.
 */
class CADENZA_EXPORT Alert
{
public:
    using Responder = std::function<int(const AlertRequest &request)>;

    /// Shows @p request application-modal and waits for the answer.
    [[nodiscard]] static int runModal(const AlertRequest &request, QWidget *parent = nullptr);
    /// Shows @p request as a sheet on @p window and returns at once; @p answered gets the answer.
    static void beginSheet(const AlertRequest &request, QWidget *window, std::function<void(int)> answered);
    /// The system's alert sound.
    static void beep();

    /// Answers every alert with @p responder instead of showing it; an empty one shows them again.
    static void setResponder(Responder responder);
    /// The alerts answered by the responder, oldest first.
    [[nodiscard]] static QList<AlertRequest> answeredRequests();
    /// How often beep() was called since the responder was set.
    [[nodiscard]] static int beepCount();
};

} // namespace Cadenza::Platform

#endif
