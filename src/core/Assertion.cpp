// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Assertion.h"

#include "cadenzacore_logging.h"

#include <QLoggingCategory>

namespace Cadenza::Platform {

namespace {
QString report(const QString &function, const QString &file, int line, const QString &message)
{
    return QStringLiteral("Assertion failure in %1, %2:%3: %4").arg(function, file).arg(line).arg(message);
}
} // namespace

AssertionFailure::AssertionFailure(
    const QString &function, const QString &file, int line, const QString &message)
    : std::logic_error(report(function, file, line, message).toStdString())
    , m_function(function)
    , m_file(file)
    , m_line(line)
    , m_message(message)
{ }

void raiseAssertion(const QString &function, const QString &file, int line, const QString &message)
{
    AssertionFailure failure(function, file, line, message);
    qCCritical(lcAssertions, "%s", failure.what());
    throw failure;
}

} // namespace Cadenza::Platform
