// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_TESTS_MODULEDRIVER_H
#define CADENZA_TESTS_MODULEDRIVER_H

#include <QByteArrayList>
#include <QElapsedTimer>
#include <QList>
#include <QProcess>

#include <vector>

/**
 * Drives an output module over its standard input and output, the way speech-dispatcher does, and
 * reads back what it says: answer lines, events and the samples of its audio events.
 */
class ModuleDriver
{
public:
    /// One thing the module said: a line (answers and events), or an audio block.
    struct Item
    {
        QByteArray line; ///< "705 AUDIO" for an audio block
        std::vector<qint16> samples;
        int sampleRate = 0;
        qint64 atMs = 0; ///< when it was read, from start()
    };

    ~ModuleDriver();
    [[nodiscard]] bool start(const QString &program, const QStringList &arguments = {});
    void send(const QByteArray &bytes);
    /// Reads until a line equal to @p line arrives after the last one waited for; false after @p timeoutMs.
    [[nodiscard]] bool waitForLine(const QByteArray &line, int timeoutMs = 20000);
    /// Reads until any line starting with one of @p prefixes arrives; the line, or empty after timeout.
    [[nodiscard]] QByteArray waitForAny(const QByteArrayList &lines, int timeoutMs = 20000);
    /// Everything read so far that came after the last takeItems() call.
    [[nodiscard]] QList<Item> takeItems();
    /// The samples of @p items' audio blocks, in order.
    [[nodiscard]] static std::vector<qint16> samplesOf(const QList<Item> &items);
    [[nodiscard]] static QByteArrayList linesOf(const QList<Item> &items);
    /// The samples of every audio event in @p stream, a capture of what a module wrote.
    [[nodiscard]] static std::vector<qint16> samplesOfStream(const QByteArray &stream);
    /// The median fundamental frequency of the voiced parts of @p samples, by autocorrelation; 0 when
    /// nothing is voiced. Rises and falls with the pitch of a voice.
    [[nodiscard]] static double medianPitchHz(const std::vector<qint16> &samples, int sampleRate);
    [[nodiscard]] QProcess &process() { return m_process; }
    [[nodiscard]] qint64 elapsedMs() const { return m_clock.elapsed(); }

private:
    void parse();

    QProcess m_process;
    QByteArray m_buffer;
    QList<Item> m_items;
    qsizetype m_seen = 0;
    qsizetype m_waited = 0; ///< where the next wait starts looking
    QElapsedTimer m_clock;
    // An audio event under construction.
    Item m_audio;
    bool m_inAudio = false;
};

#endif
