// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_MESSAGEFRAME_H
#define CADENZA_PLATFORM_MESSAGEFRAME_H

#include "cadenzaprotocol_export.h"

#include <QByteArray>

#include <optional>

namespace Cadenza::Platform {

/**
 * One message on a message-port connection: a 12-byte header (message id, flags, payload length;
 * each 32 bits, big-endian) and the payload.
 */
struct CADENZAPROTOCOL_EXPORT MessageFrame
{
    enum Flag : quint32 {
        ReplyWanted = 1u << 0, ///< the sender waits for a frame with IsReply
        IsReply = 1u << 1,
    };
    static constexpr qsizetype HeaderSize = 12;
    static constexpr qsizetype DefaultMaximumPayload = 16 * 1024 * 1024;

    qint32 messageId = 0;
    quint32 flags = 0;
    QByteArray payload;

    [[nodiscard]] QByteArray encode() const;
};

/// Cuts frames out of a byte stream as it arrives, refusing any whose payload exceeds the limit.
class CADENZAPROTOCOL_EXPORT MessageFrameReader
{
public:
    explicit MessageFrameReader(qsizetype maximumPayload = MessageFrame::DefaultMaximumPayload);

    /// Adds received bytes; false once the stream is broken (an oversized or malformed frame).
    [[nodiscard]] bool append(const QByteArray &bytes);
    /// The next complete frame, if one has arrived.
    [[nodiscard]] std::optional<MessageFrame> next();
    [[nodiscard]] bool isBroken() const { return m_broken; }
    /// Bytes waiting for the rest of their frame.
    [[nodiscard]] qsizetype pendingBytes() const { return m_buffer.size(); }

private:
    bool checkHeader();

    qsizetype m_maximumPayload;
    QByteArray m_buffer;
    bool m_broken = false;
};

} // namespace Cadenza::Platform

#endif
