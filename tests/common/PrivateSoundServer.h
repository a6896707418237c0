// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_PRIVATESOUNDSERVER_H
#define CADENZA_TESTS_PRIVATESOUNDSERVER_H

#include <QProcess>
#include <QProcessEnvironment>
#include <QTemporaryDir>

namespace Cadenza::Testing {

/**
 * A sound server of the test's own, in a folder of its own: nothing of the machine's audio is
 * heard or touched. With a microphone, its only audio input hears a silent output, so whatever play()
 * plays is what a program recording from the default input hears, in real time.
 */
class PrivateSoundServer
{
public:
    enum class Input { Microphone, None };

    explicit PrivateSoundServer(Input input = Input::Microphone);
    ~PrivateSoundServer();
    PrivateSoundServer(const PrivateSoundServer &) = delete;
    PrivateSoundServer &operator=(const PrivateSoundServer &) = delete;

    /// Whether the server runs and answers; otherwise error() says why.
    [[nodiscard]] bool isRunning() const { return m_running; }
    [[nodiscard]] QString error() const { return m_error; }
    /// What PULSE_SERVER must hold for a client to use this server.
    [[nodiscard]] QString address() const;
    /// The environment of a child process that records from this server.
    [[nodiscard]] QProcessEnvironment clientEnvironment() const;
    /// Plays @p wavPath into the output the microphone hears, in real time; true when it played.
    [[nodiscard]] bool play(const QString &wavPath);

    /// An address where no server listens.
    [[nodiscard]] static QString absentAddress(const QString &folder);

private:
    [[nodiscard]] bool answers();

    QTemporaryDir m_folder;
    QProcess m_server;
    bool m_running = false;
    QString m_error;
};

} // namespace Cadenza::Testing

#endif
