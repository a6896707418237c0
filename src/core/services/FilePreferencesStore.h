// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_FILEPREFERENCESSTORE_H
#define CADENZA_PLATFORM_FILEPREFERENCESSTORE_H

#include "PreferencesStore.h"

#include <QHash>
#include <QMutex>
#include <QVariantMap>

#include <optional>

namespace Cadenza::Platform {

/**
 * Preferences kept as one property-list file per domain in Paths::configFolder().
 *
 * A write replaces the file atomically (temporary file and rename) while holding "<file>.lock", after
 * merging this process's changes into what is on disk, so concurrent writers lose no keys. A file
 * changed by another process is re-read on the next access. A file that does not parse is renamed
 * to "<file>.corrupt-<time>" with one log line, and the domain reads as empty.
 */
class CADENZACORE_EXPORT FilePreferencesStore final : public PreferencesStore
{
public:
    /// @p folder defaults to Paths::configFolder() at the time of each access.
    explicit FilePreferencesStore(const QString &folder = QString());
    ~FilePreferencesStore() override;

    QVariant value(const QString &key, const QString &domain) override;
    void setValue(const QString &key, const QVariant &value, const QString &domain) override;
    bool synchronize(const QString &domain) override;

    /// The file that holds @p domain.
    [[nodiscard]] QString filePath(const QString &domain) const;

private:
    struct FileStamp
    {
        qint64 modifiedNs = -1;
        qint64 size = -1;
        quint64 inode = 0;
        bool operator==(const FileStamp &) const = default;
    };
    struct Domain
    {
        QVariantMap values; // as last read from disk, with pending changes applied
        QHash<QString, std::optional<QVariant>> pending; // nullopt = removal
        std::optional<FileStamp> stamp; // of the file when last read; nullopt = never read
    };

    Domain &loaded(const QString &domain);
    void reload(const QString &domain, Domain &state);
    QVariantMap readFileKeepingCorruptAside(const QString &path);
    static FileStamp stampOf(const QString &path);

    QString m_folder;
    QMutex m_mutex;
    QHash<QString, Domain> m_domains;
};

} // namespace Cadenza::Platform

#endif
