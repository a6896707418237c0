// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// A .flitevox voice file as the flite plugin reads it before handing it to flite: any bytes may sit in
// a bundle somebody copied into a voice folder.
#include "FliteVoiceFile.h"

using Cadenza::Engines::FliteVoiceFile;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    QString error;
    const auto header = FliteVoiceFile::readHeader(
        QByteArrayView(reinterpret_cast<const char *>(data), qsizetype(size)), &error);
    if (!header) {
        // A refused file is reported by its reason, so there must be one.
        if (error.isEmpty()) {
            __builtin_trap();
        }
        return 0;
    }
    // What the plugin relies on for every accepted header.
    const QByteArray language = header->features.value(QByteArrayLiteral("language"));
    if (header->voiceName.contains('\0') || (language != "eng" && language != "usenglish")) {
        __builtin_trap();
    }
    return 0;
}
