// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_BUNDLEUNPACKER_H
#define QUILLOND_BUNDLEUNPACKER_H

#include <QString>

#include <atomic>

namespace Quillond {

/// What an archive may unpack to at most.
struct UnpackLimits
{
    quint64 maximumBytes = 8ULL * 1024 * 1024 * 1024;
    quint64 maximumEntries = 200000;
};

/**
 * Unpacks a bundle archive (tar, optionally compressed; or zip) into a staging folder.
 *
 * Every member must lie inside the single top-level folder named like the bundle. Absolute
 * paths, "..", links that leave the bundle, devices and other special files are refused, and so are
 * archives that would unpack to more than the size limit (decompression bombs).
 */
class BundleUnpacker
{
public:
    using Limits = UnpackLimits;

    /// Unpacks @p archivePath into @p stagingFolder, which must exist and be empty. On failure the
    /// staging folder may hold part of the bundle; the caller removes it.
    [[nodiscard]] static bool unpack(const QString &archivePath, const QString &stagingFolder,
        const QString &bundleName, QString *error, const std::atomic<bool> *cancelled = nullptr,
        const Limits &limits = Limits());

    /// Whether @p member (a path inside the archive) belongs to @p bundleName and stays inside it.
    [[nodiscard]] static bool isSafeMember(const QString &member, const QString &bundleName);
    /// Whether a link at @p member pointing to @p target stays inside @p bundleName.
    [[nodiscard]] static bool isSafeLink(
        const QString &member, const QString &target, const QString &bundleName);
};

} // namespace Quillond

#endif
