// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PrivateSoundServer.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QThread>

namespace Cadenza::Testing {

namespace {
QString socketPath(const QString &folder)
{
    return folder + QStringLiteral("/native");
}
} // namespace

PrivateSoundServer::PrivateSoundServer(Input input)
{
    const QString folder = m_folder.path();
    QDir().mkpath(folder + QStringLiteral("/runtime"));
    QFile::setPermissions(folder + QStringLiteral("/runtime"),
        QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner);
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("HOME"), folder);
    environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), folder + QStringLiteral("/runtime"));
    environment.insert(QStringLiteral("XDG_CONFIG_HOME"), folder + QStringLiteral("/config"));
    environment.remove(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"));
    environment.remove(QStringLiteral("PULSE_SERVER"));
    m_server.setProcessEnvironment(environment);
    m_server.setProcessChannelMode(QProcess::MergedChannels);
    m_server.setStandardOutputFile(folder + QStringLiteral("/server.log"));
    // -n: none of the machine's configuration; only the modules named here.
    QStringList arguments {QStringLiteral("--daemonize=no"), QStringLiteral("-n"),
        QStringLiteral("--exit-idle-time=-1"), QStringLiteral("--disable-shm=yes"),
        QStringLiteral("--use-pid-file=no"), QStringLiteral("--log-target=stderr"),
        QStringLiteral("--load=module-native-protocol-unix auth-anonymous=1 socket=") + socketPath(folder)};
    if (input == Input::Microphone) {
        // Qt Multimedia does not offer monitors as inputs: a source fed from the monitor stands in
        // for the microphone.
        arguments << QStringLiteral("--load=module-null-sink sink_name=room rate=16000 channels=1")
                  << QStringLiteral(
                         "--load=module-remap-source master=room.monitor source_name=microphone channels=1");
    }
    m_server.start(QStringLiteral("pulseaudio"), arguments);
    if (!m_server.waitForStarted(10000)) {
        m_error = QStringLiteral("pulseaudio cannot be started: ") + m_server.errorString();
        return;
    }
    QElapsedTimer waited;
    waited.start();
    while (!answers()) {
        if (m_server.state() != QProcess::Running || waited.elapsed() > 20000) {
            QFile log(folder + QStringLiteral("/server.log"));
            m_error = QStringLiteral("the sound server does not answer");
            if (log.open(QIODevice::ReadOnly)) {
                m_error += QStringLiteral(": ") + QString::fromUtf8(log.readAll());
            }
            return;
        }
        QThread::msleep(50);
    }
    if (input == Input::Microphone) {
        QProcess pactl;
        pactl.setProcessEnvironment(clientEnvironment());
        pactl.start(
            QStringLiteral("pactl"), {QStringLiteral("set-default-source"), QStringLiteral("microphone")});
        if (!pactl.waitForFinished(10000) || pactl.exitCode() != 0) {
            m_error = QStringLiteral("the microphone cannot be made the default input");
            return;
        }
    }
    m_running = true;
}

PrivateSoundServer::~PrivateSoundServer()
{
    if (m_server.state() == QProcess::Running) {
        m_server.terminate();
        if (!m_server.waitForFinished(5000)) {
            m_server.kill();
            m_server.waitForFinished(5000);
        }
    }
}

QString PrivateSoundServer::address() const
{
    return QStringLiteral("unix:") + socketPath(m_folder.path());
}

QString PrivateSoundServer::absentAddress(const QString &folder)
{
    return QStringLiteral("unix:") + folder + QStringLiteral("/no-sound-server");
}

QProcessEnvironment PrivateSoundServer::clientEnvironment() const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("PULSE_SERVER"), address());
    return environment;
}

bool PrivateSoundServer::answers()
{
    QProcess pactl;
    pactl.setProcessEnvironment(clientEnvironment());
    pactl.start(QStringLiteral("pactl"), {QStringLiteral("info")});
    return pactl.waitForFinished(10000) && pactl.exitStatus() == QProcess::NormalExit
        && pactl.exitCode() == 0;
}

bool PrivateSoundServer::play(const QString &wavPath)
{
    QProcess player;
    player.setProcessEnvironment(clientEnvironment());
    player.setProcessChannelMode(QProcess::ForwardedChannels);
    player.start(QStringLiteral("paplay"), {QStringLiteral("--device=room"), wavPath});
    return player.waitForFinished(120000) && player.exitStatus() == QProcess::NormalExit
        && player.exitCode() == 0;
}

} // namespace Cadenza::Testing
