// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The voice index of the user's cache folder: any bytes may sit there (a disk error, another program,
// another version). Half the inputs are taken as a whole file; the other half as the payload behind
// a correct header, so that the checksum does not keep the fuzzer away from the decoder.
#include "core/formats/VoiceIndex.h"

#include <QtEndian>

#include <zlib.h>

#include <cstring>

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    if (size == 0) {
        return 0;
    }
    const QByteArray input(reinterpret_cast<const char *>(data) + 1, qsizetype(size) - 1);
    QByteArray bytes;
    if (data[0] & 1) {
        bytes = input;
    } else {
        bytes = QByteArray("CZVOIDX\n") + QByteArray(16, '\0') + input;
        qToLittleEndian<quint32>(VoiceIndex::FormatVersion, bytes.data() + 8);
        const uLong crc = crc32(0L, reinterpret_cast<const Bytef *>(input.constData()), uInt(input.size()));
        qToLittleEndian<quint32>(quint32(crc), bytes.data() + 12);
        qToLittleEndian<quint64>(quint64(input.size()), bytes.data() + 16);
    }
    QString error;
    const auto entries = VoiceIndex::decode(bytes, &error);
    if (!entries) {
        if (error.isEmpty()) {
            __builtin_trap(); // a refused index is logged by its reason
        }
        return 0;
    }
    // What the voice list relies on for every voice the index gives.
    for (auto it = entries->cbegin(); it != entries->cend(); ++it) {
        if (!it.key().startsWith(QLatin1Char('/'))) {
            __builtin_trap();
        }
        if (const auto &voice = it->voice) {
            if (voice->identifier.isEmpty() || voice->groups.isEmpty() || voice->engineName.isEmpty()
                || voice->enginePitch < 0 || voice->enginePitch > 100 || voice->engineRate < 80
                || voice->engineRate > 450 || voice->bundlePath != it.key()
                || voice->attributes.value(VoiceAttribute::Identifier).toString() != voice->identifier) {
                __builtin_trap();
            }
        } else if (it->error.isEmpty()) {
            __builtin_trap();
        }
    }
    // What was accepted survives a round trip unchanged.
    const QByteArray again = VoiceIndex::encode(*entries);
    const auto second = VoiceIndex::decode(again);
    if (!second || second->size() != entries->size() || VoiceIndex::encode(*second) != again) {
        __builtin_trap();
    }
    return 0;
}
