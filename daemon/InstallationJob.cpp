// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "InstallationJob.h"

#include "BundleUnpacker.h"
#include "Download.h"

#include "protocol/InstallerProtocol.h"
#include "protocol/KeyedArchive.h"
#include "quillond_logging.h"

#include <QCryptographicHash>
#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QStorageInfo>
#include <QTemporaryDir>
#include <QtConcurrent/QtConcurrentRun>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <linux/fs.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {
// Fault tests set QUILLOND_STALL_BEFORE to "verifying", "unpacking" or "renaming" to hold every job at
// that point for ever, so that they can kill the daemon exactly there. Unset in use.
bool stallsBefore(const char *stage)
{
    static const QByteArray stall = qgetenv("QUILLOND_STALL_BEFORE");
    if (stall != stage) {
        return false;
    }
    qCWarning(lcJob, "Stalled before %s (QUILLOND_STALL_BEFORE)", stage);
    return true;
}
} // namespace

namespace Quillond {

using namespace Cadenza::InstallerProtocol;

const QString InstallationJob::StagingPrefix = QStringLiteral(".quillond-staging-");

namespace {

// Swaps two paths in one step; the old bundle ends up where the new one was.
bool exchangePaths(const QByteArray &from, const QByteArray &to)
{
#ifdef SYS_renameat2
    return ::syscall(SYS_renameat2, AT_FDCWD, from.constData(), AT_FDCWD, to.constData(), RENAME_EXCHANGE)
        == 0;
#else
    Q_UNUSED(from);
    Q_UNUSED(to);
    errno = ENOSYS;
    return false;
#endif
}

} // namespace

InstallationJob::InstallationJob(QVariantMap request, Package package, QList<QUrl> repositories,
    Places places, QNetworkAccessManager *network, QObject *parent)
    : QObject(parent)
    , m_request(std::move(request))
    , m_package(std::move(package))
    , m_repositories(std::move(repositories))
    , m_places(std::move(places))
    , m_network(network)
    , m_cancelled(std::make_shared<std::atomic<bool>>(false))
{
    connect(&m_installWatcher, &QFutureWatcher<QString>::finished, this,
        [this] { installFinished(m_installWatcher.result()); });
}

InstallationJob::~InstallationJob()
{
    m_cancelled->store(true);
    m_installWatcher.waitForFinished();
    if (!m_stagingPath.isEmpty()) {
        QDir(m_stagingPath).removeRecursively();
    }
    if (!m_downloadPath.isEmpty()) {
        QFile::remove(m_downloadPath);
    }
}

QString InstallationJob::destinationFolder() const
{
    return m_package.kind == Package::Kind::Voice ? m_places.voicesFolder : m_places.recognizersFolder;
}

void InstallationJob::start()
{
    if (m_phase != Phase::Waiting) {
        return;
    }
    m_phase = Phase::Preparing;
    m_startReferenceTime = double(QDateTime::currentMSecsSinceEpoch()) / 1000.0 - ReferenceDateOffset;
    m_clock.start();
    Q_EMIT started();
    prepare();
}

void InstallationJob::cancel()
{
    m_cancelled->store(true);
    if (m_download) {
        m_download->cancel();
    }
    if (m_phase == Phase::Waiting || m_phase == Phase::Preparing || m_phase == Phase::Verifying) {
        finish(Outcome::Cancelled, QStringLiteral("cancelled"));
    }
    // Downloading and installing end through their own callbacks.
}

void InstallationJob::prepare()
{
    const QString destination = destinationFolder();
    if (!QDir().mkpath(destination) || !QDir().mkpath(m_places.downloadsFolder)) {
        finish(Outcome::Failed, QStringLiteral("disk: cannot create %1").arg(destination));
        return;
    }
    // Room for the archive and for what it unpacks to, with a margin.
    const quint64 needed = m_package.byteSize * 3 + 8 * 1024 * 1024;
    const QStorageInfo storage(destination);
    if (storage.isValid() && quint64(storage.bytesAvailable()) < needed) {
        finish(Outcome::Failed,
            QStringLiteral("disk space: %1 bytes needed, %2 free in %3")
                .arg(needed)
                .arg(storage.bytesAvailable())
                .arg(destination));
        return;
    }
    QList<QUrl> sources;
    for (const QUrl &base : m_repositories) {
        QUrl folder = base;
        if (!folder.path().endsWith(QLatin1Char('/'))) {
            folder.setPath(folder.path() + QLatin1Char('/'));
        }
        sources.append(folder.resolved(QUrl(m_package.path)));
    }
    m_downloadPath = m_places.downloadsFolder + QLatin1Char('/')
        + QString::fromLatin1(m_package.sha256.toHex()) + QStringLiteral(".part");
    m_phase = Phase::Downloading;
    m_download = new Download(sources, m_downloadPath, m_package.byteSize, m_network, this);
    m_download->setRetryWindow(m_retryWindow);
    m_download->setFileRate(m_fileRate);
    connect(m_download, &Download::progressed, this, [this](quint64 received) { m_received = received; });
    connect(m_download, &Download::finished, this, &InstallationJob::downloadFinished);
    m_download->start();
}

void InstallationJob::downloadFinished(bool succeeded)
{
    Download *download = std::exchange(m_download, nullptr);
    download->deleteLater();
    if (m_phase == Phase::Finished) {
        return;
    }
    if (!succeeded) {
        finish(download->failure() == Download::Failure::Cancelled ? Outcome::Cancelled : Outcome::Failed,
            download->errorText());
        return;
    }
    m_received = download->receivedBytes();
    if (stallsBefore("verifying")) {
        return;
    }
    m_phase = Phase::Verifying;
    // Nothing is unpacked unless it is exactly the file the catalogue describes.
    if (m_received != m_package.byteSize) {
        finish(Outcome::Failed,
            QStringLiteral("size: received %1 bytes, the catalogue says %2")
                .arg(m_received)
                .arg(m_package.byteSize));
        return;
    }
    if (download->sha256() != m_package.sha256) {
        finish(Outcome::Failed,
            QStringLiteral("checksum: the SHA-256 of the download is %1, the catalogue says %2")
                .arg(QString::fromLatin1(download->sha256().toHex()),
                    QString::fromLatin1(m_package.sha256.toHex())));
        return;
    }
    install();
}

void InstallationJob::install()
{
    m_phase = Phase::Installing;
    const QString destination = destinationFolder();
    QTemporaryDir staging(destination + QLatin1Char('/') + StagingPrefix + QStringLiteral("XXXXXX"));
    if (!staging.isValid()) {
        finish(Outcome::Failed, QStringLiteral("disk: cannot make a staging folder in %1").arg(destination));
        return;
    }
    staging.setAutoRemove(false);
    m_stagingPath = staging.path();
    if (stallsBefore("unpacking")) {
        return;
    }
    const QString archive = m_downloadPath;
    const QString stagingPath = m_stagingPath;
    const QString bundleName = m_package.bundleName;
    auto cancelled = m_cancelled;
    m_installWatcher.setFuture(QtConcurrent::run([=]() -> QString {
        QString error;
        if (!BundleUnpacker::unpack(archive, stagingPath, bundleName, &error, cancelled.get())) {
            return error;
        }
        return QString();
    }));
}

void InstallationJob::installFinished(const QString &error)
{
    if (m_phase == Phase::Finished) {
        return;
    }
    if (m_cancelled->load()) {
        finish(Outcome::Cancelled, QStringLiteral("cancelled"));
        return;
    }
    if (!error.isEmpty()) {
        finish(Outcome::Failed, error);
        return;
    }
    if (stallsBefore("renaming")) {
        return;
    }
    const QString built = m_stagingPath + QLatin1Char('/') + m_package.bundleName;
    const QString target = destinationFolder() + QLatin1Char('/') + m_package.bundleName;
    const QByteArray builtPath = QFile::encodeName(built);
    const QByteArray targetPath = QFile::encodeName(target);
    if (QFileInfo::exists(target) || QFileInfo(target).isSymLink()) {
        // An upgrade: swap in one step, then clear away the old bundle with the staging folder.
        if (!exchangePaths(builtPath, targetPath)) {
            // Without an atomic exchange, move the old bundle aside first; a crash between the two
            // renames leaves the old bundle in the staging folder, never half a bundle in place.
            const QByteArray aside = QFile::encodeName(m_stagingPath + QStringLiteral("/previous"));
            if (std::rename(targetPath.constData(), aside.constData()) != 0
                || std::rename(builtPath.constData(), targetPath.constData()) != 0) {
                finish(Outcome::Failed,
                    QStringLiteral("disk: cannot replace %1: %2")
                        .arg(target, QString::fromLocal8Bit(std::strerror(errno))));
                return;
            }
        }
    } else if (std::rename(builtPath.constData(), targetPath.constData()) != 0) {
        finish(Outcome::Failed,
            QStringLiteral("disk: cannot move the bundle into %1: %2")
                .arg(target, QString::fromLocal8Bit(std::strerror(errno))));
        return;
    }
    finish(Outcome::Installed);
}

void InstallationJob::finish(Outcome outcome, const QString &reason)
{
    if (m_phase == Phase::Finished) {
        return;
    }
    m_phase = Phase::Finished;
    m_outcome = outcome;
    m_failureReason = reason;
    if (!m_stagingPath.isEmpty() && !m_installWatcher.isRunning()) {
        QDir(m_stagingPath).removeRecursively();
        m_stagingPath.clear();
    }
    if (!m_downloadPath.isEmpty() && !m_download) {
        QFile::remove(m_downloadPath);
    }
    if (outcome == Outcome::Failed) {
        qCWarning(lcJob, "Installing %s failed: %s", qPrintable(m_package.tag), qPrintable(reason));
    } else {
        qCInfo(lcJob, "Installing %s: %s", qPrintable(m_package.tag),
            outcome == Outcome::Installed ? "installed" : "cancelled");
    }
    Q_EMIT finished();
}

QVariantMap InstallationJob::statusRecord() const
{
    QVariantMap record;
    for (const QString &key : {TagNameKey, ItemNameKey, ItemByteSizeKey, ObjectIDKey, ClientPortNameKey,
             ClientProcessIDKey, UserInteractionModeKey}) {
        if (m_request.contains(key)) {
            record.insert(key, m_request.value(key));
        }
    }
    const bool running = m_phase != Phase::Waiting;
    record.insert(ItemDownloadStatusKey, qint64(running ? DownloadingStatus : WaitingStatus));
    const double total = double(qMax<quint64>(1, m_package.byteSize));
    const double percent = m_phase == Phase::Installing || m_phase == Phase::Finished
        ? 100.0
        : 100.0 * double(m_received) / total;
    record.insert(ItemPercentCompleteKey, qMin(100.0, percent));
    double remaining = 0;
    if (m_phase == Phase::Downloading && m_received > 0 && m_clock.isValid()) {
        const double seconds = double(m_clock.elapsed()) / 1000.0;
        const double rate = double(m_received) / qMax(0.001, seconds);
        remaining = (double(m_package.byteSize) - double(m_received)) / rate;
    }
    record.insert(ItemSecondsRemainingKey, qMax(0.0, remaining));
    qint64 state = PreparingState;
    if (m_phase == Phase::Downloading) {
        state = DownloadingState;
    } else if (m_phase == Phase::Verifying || m_phase == Phase::Installing || m_phase == Phase::Finished) {
        state = InstallingState;
    }
    record.insert(ItemSoftwareUpdateStateKey, state);
    record.insert(ItemDownloadByteCountKey, QVariant::fromValue<quint64>(m_received));
    record.insert(ItemDownloadStartRefTimeKey, running ? m_startReferenceTime : 0.0);
    return record;
}

QByteArray InstallationJob::archivedStatusRecord() const
{
    if (m_phase == Phase::Waiting && !m_archivedWaitingRecord.isEmpty()) {
        return m_archivedWaitingRecord;
    }
    QString error;
    const auto archived = Cadenza::Platform::KeyedArchive::encodeItem(statusRecord(), &error);
    if (!archived) {
        // Only numbers and strings go into a record, so this is a programming error.
        qCWarning(lcJob, "Cannot archive the status of %s: %s", qPrintable(m_package.tag), qPrintable(error));
        return {};
    }
    if (m_phase == Phase::Waiting) {
        m_archivedWaitingRecord = *archived;
    }
    return *archived;
}

} // namespace Quillond
