// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// speech-dispatcher's commands to sd_cadenza: the line protocol, the settings lines and the messages
// (SSML or not, any bytes) must never crash the module.

#include "ModuleProtocol.h"
#include "ModuleSession.h"
#include "SpeechWorker.h"
#include "SsmlText.h"

#include <cstddef>
#include <cstdint>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QByteArray bytes(reinterpret_cast<const char *>(data), qsizetype(size));
    SdCadenza::ModuleProtocol protocol;
    // Fed in two pieces, cut where the first byte says, to reach the line splitting's edges.
    const qsizetype cut = size > 0 ? qsizetype(data[0]) % (qsizetype(size) + 1) : 0;
    protocol.feed(bytes.left(cut));
    protocol.feed(bytes.mid(cut));
    SdCadenza::SpeechSettings settings;
    while (protocol.hasRequest()) {
        const auto request = protocol.takeRequest();
        for (const QByteArray &line : request.data) {
            (void)SdCadenza::ModuleSession::applySetting(settings, line);
        }
        const QString text = SdCadenza::SsmlText::decode(request.data.join('\n'));
        for (const auto &segment : SdCadenza::SsmlText::parse(text)) {
            (void)SdCadenza::SpeechWorker::chunks(segment.text, 40);
            (void)SdCadenza::SsmlText::spelled(segment.text);
        }
    }
    return 0;
}
