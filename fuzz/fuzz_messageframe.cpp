// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Message-port streams: frames cut at arbitrary places, with a small size limit.
#include "protocol/MessageFrame.h"

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    if (size < 1) {
        return 0;
    }
    // The first byte chooses how the stream is cut into reads.
    const size_t step = size_t(data[0]) + 1;
    MessageFrameReader reader(4096);
    qsizetype framed = 0;
    for (size_t at = 1; at < size; at += step) {
        const size_t n = std::min(step, size - at);
        if (!reader.append(QByteArray(reinterpret_cast<const char *>(data + at), qsizetype(n)))) {
            break;
        }
        while (auto frame = reader.next()) {
            if (frame->payload.size() > 4096) {
                __builtin_trap();
            }
            framed += MessageFrame::HeaderSize + frame->payload.size();
            // Every frame read must encode back to the bytes it came from.
            if (frame->encode().size() != MessageFrame::HeaderSize + frame->payload.size()) {
                __builtin_trap();
            }
        }
        if (reader.pendingBytes() > 4096 + MessageFrame::HeaderSize + qsizetype(step)) {
            __builtin_trap();
        }
    }
    (void)framed;
    return 0;
}
