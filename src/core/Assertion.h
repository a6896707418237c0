// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ASSERTION_H
#define CADENZA_PLATFORM_ASSERTION_H

#include "cadenzacore_export.h"

#include <QString>

#include <stdexcept>

namespace Cadenza::Platform {

/// Raised by the assertion handler on a misuse of the library; it carries the report.
class CADENZACORE_EXPORT AssertionFailure : public std::logic_error
{
public:
    AssertionFailure(const QString &function, const QString &file, int line, const QString &message);

    [[nodiscard]] QString function() const { return m_function; }
    [[nodiscard]] QString file() const { return m_file; }
    [[nodiscard]] int line() const { return m_line; }
    [[nodiscard]] QString message() const { return m_message; }

private:
    QString m_function;
    QString m_file;
    int m_line;
    QString m_message;
};

/**
 * The assertion handler: logs "Assertion failure in <function>, <file>:<line>: <message>" and raises
 * AssertionFailure.
 */
[[noreturn]] CADENZACORE_EXPORT void raiseAssertion(
    const QString &function, const QString &file, int line, const QString &message);

} // namespace Cadenza::Platform

#endif
