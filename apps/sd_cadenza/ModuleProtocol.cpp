// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "ModuleProtocol.h"

namespace SdCadenza {

ModuleProtocol::Kind ModuleProtocol::kindOf(const QByteArray &commandWord)
{
    const QByteArray word = commandWord.toUpper();
    if (word == "INIT") {
        return Kind::Init;
    }
    if (word == "AUDIO") {
        return Kind::Audio;
    }
    if (word == "SET") {
        return Kind::Set;
    }
    if (word == "LOGLEVEL") {
        return Kind::LogLevel;
    }
    if (word == "LIST VOICES" || word == "LIST_VOICES") {
        return Kind::ListVoices;
    }
    if (word == "SPEAK") {
        return Kind::Speak;
    }
    if (word == "CHAR") {
        return Kind::Char;
    }
    if (word == "KEY") {
        return Kind::Key;
    }
    if (word == "SOUND_ICON") {
        return Kind::SoundIcon;
    }
    if (word == "STOP") {
        return Kind::Stop;
    }
    if (word == "PAUSE") {
        return Kind::Pause;
    }
    if (word == "QUIT") {
        return Kind::Quit;
    }
    if (word == "DEBUG") {
        return Kind::Debug;
    }
    return Kind::Unknown;
}

bool ModuleProtocol::takesData(Kind kind)
{
    switch (kind) {
    case Kind::Audio:
    case Kind::Set:
    case Kind::LogLevel:
    case Kind::Speak:
    case Kind::Char:
    case Kind::Key:
    case Kind::SoundIcon:
        return true;
    default:
        return false;
    }
}

void ModuleProtocol::feed(const QByteArray &bytes)
{
    m_pending.append(bytes);
    qsizetype start = 0;
    for (;;) {
        const qsizetype end = m_pending.indexOf('\n', start);
        if (end < 0) {
            break;
        }
        takeLine(m_pending.mid(start, end - start));
        start = end + 1;
    }
    m_pending.remove(0, start);
    // A line without its end may grow without bound; keep no more of it than data may hold.
    if (m_pending.size() > maximumDataBytes) {
        if (m_inData) {
            m_current.overflow = true;
        }
        m_pending.clear();
    }
}

ModuleProtocol::Request ModuleProtocol::takeRequest()
{
    Request request = std::move(m_requests.front());
    m_requests.pop_front();
    return request;
}

void ModuleProtocol::takeLine(QByteArray line)
{
    if (line.endsWith('\r')) {
        line.chop(1);
    }
    if (m_inData) {
        if (line == ".") {
            m_current.stage = Stage::DataComplete;
            m_requests.push_back(std::move(m_current));
            m_current = Request();
            m_inData = false;
            m_dataBytes = 0;
            return;
        }
        if (line.startsWith("..")) {
            line.remove(0, 1);
        }
        m_dataBytes += line.size() + 1;
        if (m_dataBytes > maximumDataBytes) {
            m_current.overflow = true;
            m_current.data.clear();
        } else if (!m_current.overflow) {
            m_current.data.append(line);
        }
        return;
    }

    Request request;
    request.line = line;
    const QByteArray trimmed = line.trimmed();
    // "LIST VOICES" is the one command of two words.
    if (trimmed.toUpper() == "LIST VOICES") {
        request.kind = Kind::ListVoices;
    } else {
        const qsizetype space = trimmed.indexOf(' ');
        request.kind = kindOf(space < 0 ? trimmed : trimmed.left(space));
        request.argument = space < 0 ? QByteArray() : trimmed.mid(space + 1).trimmed();
    }
    if (takesData(request.kind)) {
        request.stage = Stage::DataFollows;
        m_current = request;
        m_inData = true;
        m_dataBytes = 0;
    }
    m_requests.push_back(std::move(request));
}

} // namespace SdCadenza
