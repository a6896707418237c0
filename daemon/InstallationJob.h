// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_INSTALLATIONJOB_H
#define QUILLOND_INSTALLATIONJOB_H

#include "PackageCatalogue.h"

#include <QDateTime>
#include <QElapsedTimer>
#include <QFutureWatcher>
#include <QObject>
#include <QUrl>
#include <QVariantMap>

#include <atomic>
#include <memory>

class QNetworkAccessManager;

namespace Quillond {

class Download;

/**
 * One requested installation: wait, check space, download and hash, verify, unpack into a staging
 * folder beside the destination, and rename the bundle into place in one step, so that a bundle is
 * either wholly there or absent.
 */
class InstallationJob : public QObject
{
    Q_OBJECT
public:
    enum class Phase { Waiting, Preparing, Downloading, Verifying, Installing, Finished };
    enum class Outcome { None, Installed, Cancelled, Failed };

    /// Where bundles go and where downloads are kept.
    struct Places
    {
        QString voicesFolder;
        QString recognizersFolder;
        QString downloadsFolder;
    };

    InstallationJob(QVariantMap request, Package package, QList<QUrl> repositories, Places places,
        QNetworkAccessManager *network, QObject *parent = nullptr);
    ~InstallationJob() override;

    void start();
    void cancel();
    /// How long a download keeps trying sources that do not answer.
    void setRetryWindow(int milliseconds) { m_retryWindow = milliseconds; }
    /// Copies file:// sources at most this many bytes a second (0: no limit).
    void setFileRate(qint64 bytesPerSecond) { m_fileRate = bytesPerSecond; }

    [[nodiscard]] Phase phase() const { return m_phase; }
    [[nodiscard]] Outcome outcome() const { return m_outcome; }
    [[nodiscard]] QString failureReason() const { return m_failureReason; }
    [[nodiscard]] const Package &package() const { return m_package; }
    [[nodiscard]] QVariantMap request() const { return m_request; }
    /// The status record the protocol answers for this installation.
    [[nodiscard]] QVariantMap statusRecord() const;
    /// statusRecord() archived; a waiting job's record cannot change, so its bytes are made once.
    [[nodiscard]] QByteArray archivedStatusRecord() const;
    [[nodiscard]] QString destinationFolder() const;

    /// Prefix of the staging folders made beside installed bundles; left-overs are removed at start.
    static const QString StagingPrefix;

Q_SIGNALS:
    void started();
    void finished();

private:
    void prepare();
    void downloadFinished(bool succeeded);
    void install();
    void installFinished(const QString &error);
    void finish(Outcome outcome, const QString &reason = QString());

    QVariantMap m_request;
    Package m_package;
    QList<QUrl> m_repositories;
    Places m_places;
    QNetworkAccessManager *m_network;
    int m_retryWindow = 60000;
    qint64 m_fileRate = 0;
    Phase m_phase = Phase::Waiting;
    Outcome m_outcome = Outcome::None;
    QString m_failureReason;
    Download *m_download = nullptr;
    QString m_downloadPath;
    QString m_stagingPath;
    quint64 m_received = 0;
    double m_startReferenceTime = 0;
    QElapsedTimer m_clock;
    mutable QByteArray m_archivedWaitingRecord;
    std::shared_ptr<std::atomic<bool>> m_cancelled;
    QFutureWatcher<QString> m_installWatcher;
};

} // namespace Quillond

#endif
