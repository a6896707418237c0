// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_VOICEINDEX_H
#define CADENZA_PLATFORM_VOICEINDEX_H

#include "core/formats/VoiceDescription.h"

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QHash>
#include <QSet>
#include <QString>

#include <optional>

namespace Cadenza::Platform {

/**
 * The voice bundles parsed by earlier processes, kept in one file of the user's cache folder so that
 * a process can stat the bundles instead of parsing every Info.plist again.
 *
 * Each entry is keyed by the bundle folder's path and its Info.plist's stamp (modification time,
 * size, inode): a bundle whose stamp differs is parsed again. A file that is missing, damaged, of
 * another program or of another format version is ignored and written anew, never trusted: the
 * voice list must be what parsing every bundle gives. The file is replaced by an atomic rename, so
 * processes updating it at once never see a half-written index (the last one to finish wins; what it
 * lost is parsed again later).
 */
class CADENZACORE_EXPORT VoiceIndex
{
public:
    /// The format written; a file of any other version is not read.
    static constexpr quint32 FormatVersion = 1;
    /// The largest index file read.
    static constexpr qint64 MaximumFileSize = 256 * 1024 * 1024;

    struct Stamp
    {
        qint64 modifiedNs = 0;
        qint64 size = 0;
        quint64 inode = 0;
        friend bool operator==(const Stamp &, const Stamp &) = default;
    };

    struct Entry
    {
        Stamp stamp;
        std::optional<VoiceDescription> voice; ///< nothing for a bundle that was refused
        QString error; ///< why it was refused
    };
    using Entries = QHash<QString, Entry>; ///< by bundle folder path

    /// $XDG_CACHE_HOME/cadenza/voices.index
    [[nodiscard]] static QString defaultPath();

    explicit VoiceIndex(const QString &path);

    /// Reads the file; false (the index left empty, @p why set) when it is missing or not trusted.
    bool load(QString *why = nullptr);
    /// Writes the index when it changed since load(); false, with @p error set, when that failed.
    [[nodiscard]] bool saveIfChanged(QString *error = nullptr);

    /// The entry of @p bundlePath when its stamp is still @p stamp.
    [[nodiscard]] const Entry *find(const QString &bundlePath, const Stamp &stamp) const;
    void insert(const QString &bundlePath, const Entry &entry);
    /// Forgets the bundles directly in @p folder that are not in @p present.
    void retainInFolder(const QString &folder, const QSet<QString> &present);

    [[nodiscard]] const Entries &entries() const { return m_entries; }
    [[nodiscard]] bool isChanged() const { return m_changed; }

    /// The file's bytes for @p entries; entries that cannot be written (values of other types, nesting
    /// too deep) are left out.
    [[nodiscard]] static QByteArray encode(const Entries &entries);
    /// The entries of a file's bytes; nothing, with @p error set, for anything but a whole, intact
    /// index of this format version.
    [[nodiscard]] static std::optional<Entries> decode(const QByteArray &bytes, QString *error = nullptr);

private:
    QString m_path;
    Entries m_entries;
    bool m_changed = false;
};

} // namespace Cadenza::Platform

#endif
