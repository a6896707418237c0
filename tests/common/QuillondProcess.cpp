// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "QuillondProcess.h"

#include "core/files/Paths.h"
#include "core/services/UnixMessagePortService.h"
#include "protocol/InstallerProtocol.h"

#include <QDirIterator>

#include <QTest>

#include <cstdio>
#include <signal.h>

namespace Cadenza::Testing {

QuillondProcess::QuillondProcess()
{
    // The daemon's log is kept for waitForLog() and also shown, as the test's own output.
    QObject::connect(&m_process, &QProcess::readyReadStandardError, &m_process, [this] {
        const QByteArray bytes = m_process.readAllStandardError();
        m_log += QString::fromLocal8Bit(bytes);
        std::fwrite(bytes.constData(), 1, size_t(bytes.size()), stderr);
    });
}

bool QuillondProcess::start(const QStringList &arguments, const QStringList &environment)
{
    QProcessEnvironment variables = QProcessEnvironment::systemEnvironment();
    for (const QString &entry : environment) {
        variables.insert(entry.section(QLatin1Char('='), 0, 0), entry.section(QLatin1Char('='), 1));
    }
    m_process.setProcessEnvironment(variables);
    m_log.clear();
    m_process.start(QStringLiteral(QUILLOND_PATH), arguments);
    if (!m_process.waitForStarted(5000)) {
        return false;
    }
    Platform::UnixMessagePortService ports;
    return QTest::qWaitFor(
        [&] { return ports.createRemotePort(InstallerProtocol::LivenessPortName) != nullptr; }, 5000);
}

bool QuillondProcess::waitForLog(const QString &text, int milliseconds)
{
    return QTest::qWaitFor([&] { return m_log.contains(text); }, milliseconds);
}

QStringList QuillondProcess::leftovers()
{
    QStringList found;
    for (const QString &folder : {Platform::Paths::userVoicesFolder(),
             Platform::Paths::userRecognizersFolder(), Platform::Paths::cacheFolder()}) {
        QDirIterator it(
            folder, QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot, QDirIterator::Subdirectories);
        while (it.hasNext()) {
            const QString path = it.next();
            if (path.contains(QStringLiteral(".quillond-staging-"))
                || path.endsWith(QStringLiteral(".part"))) {
                found.append(path);
            }
        }
    }
    return found;
}

void QuillondProcess::kill()
{
    ::kill(pid_t(m_process.processId()), SIGKILL);
    m_process.waitForFinished(5000);
}

void QuillondProcess::terminate()
{
    if (m_process.state() != QProcess::NotRunning) {
        m_process.terminate();
        m_process.waitForFinished(5000);
    }
}

} // namespace Cadenza::Testing
