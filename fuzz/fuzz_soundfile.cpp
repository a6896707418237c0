// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// A sound file as "cadenza dictate" reads it: any bytes may be handed to it. The reader must refuse
// with a reason or deliver blocks of bounded size until the end (compressed formats may hold far
// more samples than bytes, so only the rounds are capped).
#include "core/formats/AudioFileReader.h"

#include <QFile>
#include <QTemporaryDir>

using Cadenza::Platform::AudioFileReader;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static QTemporaryDir folder;
    const QString path = folder.filePath(QStringLiteral("input.wav"));
    {
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
            __builtin_trap();
        }
        file.write(reinterpret_cast<const char *>(data), qint64(size));
    }
    AudioFileReader reader(16000);
    QString error;
    if (!reader.open(path, &error)) {
        if (error.isEmpty()) {
            __builtin_trap();
        }
        return 0;
    }
    for (int round = 0; round < 100000; ++round) {
        const auto block = reader.read(1024, &error);
        if (!block) {
            if (error.isEmpty()) {
                __builtin_trap();
            }
            return 0;
        }
        if (block->empty()) {
            return 0;
        }
        // A block is about the asked frames at the highest rate ratio (1000 Hz up to 16 kHz).
        if (block->size() > 1024 * 16 + 512) {
            __builtin_trap();
        }
    }
    return 0;
}
