// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_QUILLONDPROCESS_H
#define CADENZA_TESTS_QUILLONDPROCESS_H

#include <QProcess>
#include <QStringList>

namespace Cadenza::Testing {

/// A real quillond for a test: started with arguments, ready once its liveness port answers.
class QuillondProcess
{
public:
    QuillondProcess();
    ~QuillondProcess() { terminate(); }

    /// Starts the daemon and waits up to 5 s for it to serve; false when it does not.
    /// @p environment adds variables ("NAME=value") to the test's own.
    [[nodiscard]] bool start(const QStringList &arguments, const QStringList &environment = {});
    /// Waits up to @p milliseconds for @p text in what the daemon has logged.
    [[nodiscard]] bool waitForLog(const QString &text, int milliseconds = 10000);
    /// Kills it without warning, as a crash would.
    void kill();
    /// Asks it to stop and waits for it.
    void terminate();
    /// What a daemon leaves behind when it stops half way: partial downloads and staging folders in
    /// the user's voice, recognizer and cache folders.
    [[nodiscard]] static QStringList leftovers();

private:
    QProcess m_process;
    QString m_log;
};

} // namespace Cadenza::Testing

#endif
