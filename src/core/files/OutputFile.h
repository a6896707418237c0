// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_OUTPUTFILE_H
#define CADENZA_PLATFORM_OUTPUTFILE_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QString>

namespace Cadenza::Platform {

/**
 * The one way Cadenza writes a file it is asked to write, whatever the file is for.
 *
 * A regular file (or nothing) at the path is replaced atomically: the bytes go into a temporary file
 * beside it, which is renamed over it only once complete, keeping the old file's permissions. A
 * character device or a FIFO is written directly, as a shell redirection would, and is never
 * replaced; a FIFO must have a reader already (nothing waits for one to come). A folder, a block device or a
 * socket is refused: nothing that is not a regular file Cadenza writes is ever deleted or replaced. A
 * symbolic link is followed to what it names.
 */
class CADENZACORE_EXPORT OutputFile
{
public:
    enum class Kind {
        Replaceable, ///< a regular file or nothing: atomic replace
        Stream, ///< a character device or a FIFO: written in place
        Refused, ///< anything else
    };

    /// What is at @p path (after symbolic links); for Refused, @p reason says why.
    [[nodiscard]] static Kind kindOf(const QString &path, QString *reason = nullptr);
    /// Writes @p bytes to @p path by the rules above; false, with @p error set, when nothing was written.
    [[nodiscard]] static bool write(const QString &path, const QByteArray &bytes, QString *error = nullptr);
};

} // namespace Cadenza::Platform

#endif
