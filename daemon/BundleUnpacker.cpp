// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "BundleUnpacker.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStringList>

#include <archive.h>
#include <archive_entry.h>

#include <memory>
#include <optional>

namespace Quillond {

namespace {

struct ReadCloser
{
    void operator()(archive *a) const { archive_read_free(a); }
};
struct WriteCloser
{
    void operator()(archive *a) const { archive_write_free(a); }
};

// Normalises a relative path; nothing when it climbs above its start.
std::optional<QStringList> normalised(const QStringList &parts)
{
    QStringList out;
    for (const QString &part : parts) {
        if (part.isEmpty() || part == u".") {
            continue;
        }
        if (part == u"..") {
            if (out.isEmpty()) {
                return std::nullopt;
            }
            out.removeLast();
            continue;
        }
        out.append(part);
    }
    return out;
}

} // namespace

bool BundleUnpacker::isSafeMember(const QString &member, const QString &bundleName)
{
    if (member.isEmpty() || member.startsWith(QLatin1Char('/')) || member.contains(QChar(0))) {
        return false;
    }
    QStringList parts = member.split(QLatin1Char('/'));
    if (parts.contains(QStringLiteral(".."))) {
        return false;
    }
    const auto clean = normalised(parts);
    return clean && !clean->isEmpty() && clean->first() == bundleName;
}

bool BundleUnpacker::isSafeLink(const QString &member, const QString &target, const QString &bundleName)
{
    if (target.isEmpty() || target.startsWith(QLatin1Char('/')) || !isSafeMember(member, bundleName)) {
        return false;
    }
    QStringList parts = *normalised(member.split(QLatin1Char('/')));
    parts.removeLast(); // a link's target is relative to the folder that holds it
    parts.append(target.split(QLatin1Char('/')));
    const auto resolved = normalised(parts);
    return resolved && resolved->size() >= 1 && resolved->first() == bundleName;
}

bool BundleUnpacker::unpack(const QString &archivePath, const QString &stagingFolder,
    const QString &bundleName, QString *error, const std::atomic<bool> *cancelled, const Limits &limits)
{
    std::unique_ptr<archive, ReadCloser> reader(archive_read_new());
    archive_read_support_filter_all(reader.get());
    archive_read_support_format_tar(reader.get());
    archive_read_support_format_gnutar(reader.get());
    archive_read_support_format_zip(reader.get());
    if (archive_read_open_filename(reader.get(), QFile::encodeName(archivePath).constData(), 64 * 1024)
        != ARCHIVE_OK) {
        *error = QStringLiteral("bad archive: %1").arg(QString::fromUtf8(archive_error_string(reader.get())));
        return false;
    }
    std::unique_ptr<archive, WriteCloser> writer(archive_write_disk_new());
    // libarchive's own guards, on top of the checks below. Members are written under the staging
    // folder's absolute path, so absolute paths as such cannot be refused here; the checks below do.
    archive_write_disk_set_options(writer.get(),
        ARCHIVE_EXTRACT_SECURE_SYMLINKS | ARCHIVE_EXTRACT_SECURE_NODOTDOT | ARCHIVE_EXTRACT_NO_OVERWRITE
            | ARCHIVE_EXTRACT_PERM);

    // Without links on the way, so that the symbolic-link guard looks only at what the archive makes.
    const QString canonical = QFileInfo(stagingFolder).canonicalFilePath();
    if (canonical.isEmpty()) {
        *error = QStringLiteral("disk: the staging folder %1 is gone").arg(stagingFolder);
        return false;
    }
    const QString root = canonical + QLatin1Char('/');
    quint64 entries = 0;
    quint64 bytes = 0;
    bool sawBundle = false;
    archive_entry *entry = nullptr;
    while (true) {
        const int status = archive_read_next_header(reader.get(), &entry);
        if (status == ARCHIVE_EOF) {
            break;
        }
        if (status != ARCHIVE_OK && status != ARCHIVE_WARN) {
            *error = QStringLiteral("bad archive: %1")
                         .arg(QString::fromUtf8(archive_error_string(reader.get())));
            return false;
        }
        if (cancelled && cancelled->load()) {
            *error = QStringLiteral("cancelled");
            return false;
        }
        if (++entries > limits.maximumEntries) {
            *error = QStringLiteral("bad archive: more than %1 members").arg(limits.maximumEntries);
            return false;
        }
        const char *rawName = archive_entry_pathname(entry);
        const QString member = rawName ? QString::fromUtf8(rawName) : QString();
        if (!isSafeMember(member, bundleName)) {
            *error = QStringLiteral("bad archive: member '%1' lies outside %2")
                         .arg(member.left(200), bundleName);
            return false;
        }
        const mode_t type = archive_entry_filetype(entry);
        if (type == AE_IFLNK) {
            const char *target = archive_entry_symlink(entry);
            if (!target || !isSafeLink(member, QString::fromUtf8(target), bundleName)) {
                *error = QStringLiteral("bad archive: link '%1' leaves the bundle").arg(member.left(200));
                return false;
            }
        } else if (const char *hardTarget = archive_entry_hardlink(entry)) {
            if (!isSafeMember(QString::fromUtf8(hardTarget), bundleName)) {
                *error
                    = QStringLiteral("bad archive: hard link '%1' leaves the bundle").arg(member.left(200));
                return false;
            }
            archive_entry_set_hardlink(
                entry, QFile::encodeName(root + QString::fromUtf8(hardTarget)).constData());
        } else if (type != AE_IFREG && type != AE_IFDIR) {
            *error = QStringLiteral("bad archive: '%1' is a special file").arg(member.left(200));
            return false;
        }
        if (archive_entry_size_is_set(entry)) {
            bytes += quint64(qMax<la_int64_t>(0, archive_entry_size(entry)));
        }
        if (bytes > limits.maximumBytes) {
            *error = QStringLiteral("bad archive: it unpacks to more than %1 bytes").arg(limits.maximumBytes);
            return false;
        }
        sawBundle = true;
        // Owner-only bits from the archive; never set-id bits.
        archive_entry_set_perm(entry, archive_entry_perm(entry) & 0755);
        archive_entry_set_pathname(entry, QFile::encodeName(root + member).constData());
        if (archive_write_header(writer.get(), entry) != ARCHIVE_OK) {
            *error = QStringLiteral("cannot unpack '%1': %2")
                         .arg(member.left(200), QString::fromUtf8(archive_error_string(writer.get())));
            return false;
        }
        if (type == AE_IFREG && archive_entry_size(entry) > 0) {
            const void *block = nullptr;
            size_t size = 0;
            la_int64_t offset = 0;
            quint64 written = 0;
            while (true) {
                const int r = archive_read_data_block(reader.get(), &block, &size, &offset);
                if (r == ARCHIVE_EOF) {
                    break;
                }
                if (r != ARCHIVE_OK && r != ARCHIVE_WARN) {
                    *error = QStringLiteral("bad archive: %1")
                                 .arg(QString::fromUtf8(archive_error_string(reader.get())));
                    return false;
                }
                written += size;
                // Sizes in headers can lie; count what really comes out.
                if (written > quint64(archive_entry_size(entry)) || bytes > limits.maximumBytes) {
                    *error = QStringLiteral("bad archive: '%1' is larger than its header says")
                                 .arg(member.left(200));
                    return false;
                }
                if (archive_write_data_block(writer.get(), block, size, offset) != ARCHIVE_OK) {
                    *error
                        = QStringLiteral("cannot write '%1': %2")
                              .arg(member.left(200), QString::fromUtf8(archive_error_string(writer.get())));
                    return false;
                }
                if (cancelled && cancelled->load()) {
                    *error = QStringLiteral("cancelled");
                    return false;
                }
            }
        }
        if (archive_write_finish_entry(writer.get()) != ARCHIVE_OK) {
            *error = QStringLiteral("cannot finish '%1': %2")
                         .arg(member.left(200), QString::fromUtf8(archive_error_string(writer.get())));
            return false;
        }
    }
    if (archive_write_close(writer.get()) != ARCHIVE_OK) {
        *error = QStringLiteral("cannot finish unpacking: %1")
                     .arg(QString::fromUtf8(archive_error_string(writer.get())));
        return false;
    }
    if (!sawBundle || !QFileInfo(root + bundleName).isDir()) {
        *error = QStringLiteral("bad archive: it holds no %1 folder").arg(bundleName);
        return false;
    }
    return true;
}

} // namespace Quillond
