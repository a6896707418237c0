// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FilePreferencesStore.h"

#include "core/files/FileLock.h"

#include "cadenzacore_logging.h"
#include "core/files/OutputFile.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"

#include <QDateTime>
#include <QDir>
#include <QFile>

#include <sys/stat.h>

namespace Cadenza::Platform {

FilePreferencesStore::FilePreferencesStore(const QString &folder)
    : m_folder(folder)
{ }

FilePreferencesStore::~FilePreferencesStore() = default;

QString FilePreferencesStore::filePath(const QString &domain) const
{
    const QString folder = m_folder.isEmpty() ? Paths::configFolder() : m_folder;
    return folder + QLatin1Char('/') + domain + QStringLiteral(".plist");
}

FilePreferencesStore::FileStamp FilePreferencesStore::stampOf(const QString &path)
{
    struct stat st
    {
    };
    if (::stat(QFile::encodeName(path).constData(), &st) != 0) {
        return {};
    }
    return {
        qint64(st.st_mtim.tv_sec) * 1000000000 + st.st_mtim.tv_nsec, qint64(st.st_size), quint64(st.st_ino)};
}

QVariantMap FilePreferencesStore::readFileKeepingCorruptAside(const QString &path)
{
    QFile file(path);
    if (!file.exists()) {
        return {};
    }
    if (!file.open(QIODevice::ReadOnly)) {
        qCWarning(lcPreferences, "Cannot read preferences %s: %s", qPrintable(path),
            qPrintable(file.errorString()));
        return {};
    }
    const QByteArray bytes = file.readAll();
    file.close();
    if (bytes.trimmed().isEmpty()) {
        return {};
    }
    QString error;
    const auto parsed = PropertyList::parse(bytes, &error);
    if (parsed && parsed->typeId() == QMetaType::QVariantMap) {
        return parsed->toMap();
    }
    // Never overwrite what we cannot read: the user may want it back.
    const QString aside = path + QStringLiteral(".corrupt-")
        + QDateTime::currentDateTimeUtc().toString(QStringLiteral("yyyyMMdd-HHmmss-zzz"));
    if (QFile::rename(path, aside)) {
        qCWarning(lcPreferences, "Preferences %s are damaged (%s); kept aside as %s", qPrintable(path),
            qPrintable(parsed ? QStringLiteral("the top level is not a dictionary") : error),
            qPrintable(aside));
    } else {
        qCWarning(lcPreferences, "Preferences %s are damaged (%s) and could not be kept aside",
            qPrintable(path), qPrintable(error));
    }
    return {};
}

void FilePreferencesStore::reload(const QString &domain, Domain &state)
{
    const QString path = filePath(domain);
    state.stamp = stampOf(path);
    state.values = readFileKeepingCorruptAside(path);
    for (auto it = state.pending.cbegin(); it != state.pending.cend(); ++it) {
        if (it.value()) {
            state.values.insert(it.key(), *it.value());
        } else {
            state.values.remove(it.key());
        }
    }
}

FilePreferencesStore::Domain &FilePreferencesStore::loaded(const QString &domain)
{
    Domain &state = m_domains[domain];
    if (!state.stamp || *state.stamp != stampOf(filePath(domain))) {
        reload(domain, state);
    }
    return state;
}

QVariant FilePreferencesStore::value(const QString &key, const QString &domain)
{
    if (!isValidDomainName(domain)) {
        return {};
    }
    QMutexLocker locker(&m_mutex);
    return loaded(domain).values.value(key);
}

void FilePreferencesStore::setValue(const QString &key, const QVariant &value, const QString &domain)
{
    if (!isValidDomainName(domain)) {
        qCWarning(lcPreferences, "Refusing preference domain name '%s'", qPrintable(domain.left(80)));
        return;
    }
    QMutexLocker locker(&m_mutex);
    Domain &state = loaded(domain);
    if (value.isValid()) {
        state.values.insert(key, value);
        state.pending.insert(key, value);
    } else {
        state.values.remove(key);
        state.pending.insert(key, std::nullopt);
    }
}

bool FilePreferencesStore::synchronize(const QString &domain)
{
    if (!isValidDomainName(domain)) {
        return false;
    }
    QMutexLocker locker(&m_mutex);
    Domain &state = m_domains[domain];
    const QString path = filePath(domain);
    if (state.pending.isEmpty()) {
        if (!state.stamp || *state.stamp != stampOf(path)) {
            reload(domain, state);
        }
        return true;
    }

    if (!QDir().mkpath(QFileInfo(path).absolutePath())) {
        qCWarning(lcPreferences, "Cannot create the preferences folder for %s", qPrintable(path));
        return false;
    }
    // A hidden lock file beside the domain's file; it stays, as the lock is the kernel's, not the file's.
    const QFileInfo info(path);
    FileLock lock(info.absolutePath() + QStringLiteral("/.") + info.fileName() + QStringLiteral(".lock"));
    if (!lock.lock()) {
        qCWarning(lcPreferences, "Cannot lock %s: %s", qPrintable(path), qPrintable(lock.errorString()));
        return false;
    }
    // Merge onto the file as it is now, so keys written meanwhile by other processes survive.
    reload(domain, state);

    QString error;
    if (!OutputFile::write(path, PropertyList::serialize(state.values), &error)) {
        qCWarning(lcPreferences, "Cannot write preferences %s: %s", qPrintable(path), qPrintable(error));
        return false;
    }
    state.pending.clear();
    state.stamp = stampOf(path);
    return true;
}

} // namespace Cadenza::Platform
