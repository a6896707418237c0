// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_BUNDLEREMOVAL_H
#define CADENZA_PLATFORM_BUNDLEREMOVAL_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

/**
 * Removes exactly one voice or recognizer bundle, and nothing else.
 *
 * The path must name a folder ending in ".SpeechVoice" or ".SpeechRecognition" that lies directly in
 * one of the known voice or recognizer folders, reached without symbolic links. The bundle is then
 * deleted level by level through directory handles opened without following links, so a link
 * swapped in meanwhile makes the removal fail rather than reach outside.
 */
class CADENZACORE_EXPORT BundleRemoval
{
public:
    /// The folders bundles may be removed from: the voice and recognizer folders.
    [[nodiscard]] static QStringList knownFolders();
    /// Why @p path may not be removed, or an empty string when it may.
    [[nodiscard]] static QString refusal(const QString &path, const QStringList &folders = knownFolders());
    /// Removes the bundle at @p path; false, with @p error set, when refused or when it failed.
    [[nodiscard]] static bool remove(
        const QString &path, QString *error, const QStringList &folders = knownFolders());
};

} // namespace Cadenza::Platform

#endif
