// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_REQUESTCHECK_H
#define QUILLOND_REQUESTCHECK_H

#include <QString>
#include <QVariantMap>

namespace Quillond {

/**
 * The shape an installation request must have before anything of it is kept: each known field of
 * the right type and size. What a client sends becomes status records that every other client
 * decodes, so one malformed request must not reach them.
 */
class RequestCheck
{
public:
    /// Why @p request cannot be accepted, for people; empty when it can.
    [[nodiscard]] static QString problemWith(const QVariantMap &request);
    /// Whether @p name is a client port name: the service name, a hyphen and a number 0..65535.
    [[nodiscard]] static bool isClientPortName(const QString &name);
    /// @p value when it is a string (the only kind echoed back to a client), else nothing.
    [[nodiscard]] static QVariant echoable(const QVariant &value);
};

} // namespace Quillond

#endif
