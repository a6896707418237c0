// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Downloaded archives: unpacked into a staging folder, never anywhere else.
#include "BundleUnpacker.h"

#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static QTemporaryDir work;
    const QString archive = work.filePath(QStringLiteral("input.archive"));
    const QString staging = work.filePath(QStringLiteral("staging"));
    QDir(staging).removeRecursively();
    QDir().mkpath(staging);
    {
        QFile file(archive);
        if (!file.open(QIODevice::WriteOnly)) {
            return 0;
        }
        file.write(reinterpret_cast<const char *>(data), qsizetype(size));
    }
    QString error;
    Quillond::UnpackLimits limits;
    limits.maximumBytes = 16 * 1024 * 1024;
    limits.maximumEntries = 1000;
    (void)Quillond::BundleUnpacker::unpack(
        archive, staging, QStringLiteral("Fuzz.SpeechVoice"), &error, nullptr, limits);
    // Whatever happened, nothing may exist beside the staging folder but the input.
    const QStringList names
        = QDir(work.path()).entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot);
    for (const QString &name : names) {
        if (name != u"staging" && name != u"input.archive") {
            __builtin_trap();
        }
    }
    // And inside it only the bundle's folder.
    const QStringList inside
        = QDir(staging).entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot);
    if (inside.size() > 1 || (inside.size() == 1 && inside.first() != u"Fuzz.SpeechVoice")) {
        __builtin_trap();
    }
    return 0;
}
