// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "MessageFrame.h"

#include <QtEndian>

namespace Cadenza::Platform {

namespace {
constexpr quint32 KnownFlags = MessageFrame::ReplyWanted | MessageFrame::IsReply;
}

QByteArray MessageFrame::encode() const
{
    QByteArray bytes(HeaderSize + payload.size(), Qt::Uninitialized);
    qToBigEndian<qint32>(messageId, bytes.data());
    qToBigEndian<quint32>(flags, bytes.data() + 4);
    qToBigEndian<quint32>(quint32(payload.size()), bytes.data() + 8);
    std::copy(payload.cbegin(), payload.cend(), bytes.begin() + HeaderSize);
    return bytes;
}

MessageFrameReader::MessageFrameReader(qsizetype maximumPayload)
    : m_maximumPayload(maximumPayload)
{ }

bool MessageFrameReader::checkHeader()
{
    if (m_buffer.size() < MessageFrame::HeaderSize) {
        return true;
    }
    const quint32 flags = qFromBigEndian<quint32>(m_buffer.constData() + 4);
    const quint32 length = qFromBigEndian<quint32>(m_buffer.constData() + 8);
    if ((flags & ~KnownFlags) != 0 || qsizetype(length) > m_maximumPayload) {
        m_broken = true;
        m_buffer.clear();
    }
    return !m_broken;
}

bool MessageFrameReader::append(const QByteArray &bytes)
{
    if (m_broken) {
        return false;
    }
    m_buffer.append(bytes);
    return checkHeader();
}

std::optional<MessageFrame> MessageFrameReader::next()
{
    if (m_broken || m_buffer.size() < MessageFrame::HeaderSize || !checkHeader()) {
        return std::nullopt;
    }
    const quint32 length = qFromBigEndian<quint32>(m_buffer.constData() + 8);
    if (m_buffer.size() < MessageFrame::HeaderSize + qsizetype(length)) {
        return std::nullopt;
    }
    MessageFrame frame;
    frame.messageId = qFromBigEndian<qint32>(m_buffer.constData());
    frame.flags = qFromBigEndian<quint32>(m_buffer.constData() + 4);
    frame.payload = m_buffer.mid(MessageFrame::HeaderSize, length);
    m_buffer.remove(0, MessageFrame::HeaderSize + length);
    checkHeader();
    return frame;
}

} // namespace Cadenza::Platform
