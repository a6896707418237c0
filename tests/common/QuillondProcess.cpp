#include "QuillondProcess.h"

#include "installation/InstallerProtocol.h"
#include "platform/UnixMessagePortService.h"

#include <QTest>

#include <signal.h>

namespace Cadenza::Testing {

bool QuillondProcess::start(const QStringList &arguments)
{
    m_process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    m_process.start(QStringLiteral(QUILLOND_PATH), arguments);
    if (!m_process.waitForStarted(5000)) {
        return false;
    }
    Platform::UnixMessagePortService ports;
    return QTest::qWaitFor(
        [&] { return ports.createRemotePort(InstallerProtocol::LivenessPortName) != nullptr; }, 5000);
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
