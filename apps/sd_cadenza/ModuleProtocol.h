// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_MODULEPROTOCOL_H
#define SD_CADENZA_MODULEPROTOCOL_H

#include <QByteArray>
#include <QByteArrayList>

#include <deque>

namespace SdCadenza {

/**
 * Splits the byte stream speech-dispatcher writes to an output module into commands.
 *
 * Lines end in LF (a CR before it is dropped). SPEAK, CHAR, KEY, SOUND_ICON, SET, AUDIO and LOGLEVEL
 * are followed by data lines closed by a line holding a single dot; a data line that starts with a dot
 * had one more dot put before it, which is taken away here. Each such command yields two requests:
 * one when its first line arrives (so the module can answer at once) and one with its data.
 */
class ModuleProtocol
{
public:
    enum class Kind {
        Init,
        Audio,
        Set,
        LogLevel,
        ListVoices,
        Speak,
        Char,
        Key,
        SoundIcon,
        Stop,
        Pause,
        Quit,
        Debug,
        Unknown, ///< an empty line or a command nobody knows
    };
    enum class Stage {
        Single, ///< a command without data
        DataFollows, ///< the first line of a command with data
        DataComplete, ///< the data of a command, up to its closing dot
    };

    struct Request
    {
        Kind kind = Kind::Unknown;
        Stage stage = Stage::Single;
        QByteArray line; ///< the command line as received
        QByteArray argument; ///< what follows the command word on its line
        QByteArrayList data; ///< the data lines, unescaped (DataComplete only)
        bool overflow = false; ///< the data outgrew maximumDataBytes and was dropped
    };

    /// Data beyond this many bytes is dropped (the request says overflow) rather than kept in memory.
    static constexpr qsizetype maximumDataBytes = 64 * 1024 * 1024;

    /// Takes more bytes from the stream.
    void feed(const QByteArray &bytes);
    /// True while a request is waiting.
    [[nodiscard]] bool hasRequest() const { return !m_requests.empty(); }
    /// The oldest waiting request.
    [[nodiscard]] Request takeRequest();
    /// True while the data lines of a command are being received.
    [[nodiscard]] bool inData() const { return m_inData; }

    /// Which command a command line names.
    [[nodiscard]] static Kind kindOf(const QByteArray &commandWord);
    [[nodiscard]] static bool takesData(Kind kind);

private:
    void takeLine(QByteArray line);

    QByteArray m_pending;
    std::deque<Request> m_requests;
    bool m_inData = false;
    Request m_current;
    qsizetype m_dataBytes = 0;
};

} // namespace SdCadenza

#endif
