// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_QUILLONDAEMON_H
#define QUILLOND_QUILLONDAEMON_H

#include "InstallationJob.h"
#include "PackageCatalogue.h"

#include <QList>
#include <QNetworkAccessManager>
#include <QObject>
#include <QPointer>
#include <QTimer>
#include <QUrl>

#include <memory>

namespace Cadenza::Platform {
class LocalMessagePort;
struct MessagePeer;
} // namespace Cadenza::Platform

namespace Quillond {

/**
 * The speech-data installer daemon: answers the request port, keeps the queue of installations
 * (one runs at a time, in request order), reports their status, posts the started and finished
 * notifications and tells each client on its own port how its request ended.
 */
class QuillonDaemon : public QObject
{
    Q_OBJECT
public:
    struct Options
    {
        QList<QUrl> repositories;
        QString cataloguePath;
        int requestPortDescriptor = -1; ///< a listening socket handed over by the service manager
        int idleExitSeconds = 0; ///< 0: run until stopped
        int maximumQueuedRequests = 256;
        int retryWindowMilliseconds = 60000; ///< how long a download tries sources that do not answer
        qint64 fileRate = 0; ///< bytes a second for file:// sources; 0: no limit
    };

    QuillonDaemon(PackageCatalogue catalogue, Options options, QObject *parent = nullptr);
    ~QuillonDaemon() override;

    /// Opens the ports; false, with @p error set, when another daemon is running.
    [[nodiscard]] bool start(QString *error);
    /// Cancels everything and closes the ports.
    void stop();

    /// Removes staging folders and partial downloads left by a daemon that was killed.
    static void removeLeftovers(const InstallationJob::Places &places);
    [[nodiscard]] static InstallationJob::Places defaultPlaces();

Q_SIGNALS:
    void idle();

private:
    std::optional<QByteArray> handle(
        qint32 messageId, const QByteArray &data, const Cadenza::Platform::MessagePeer &peer);
    /// Answers a request that does not decode as a request, when it names a port to answer on.
    void refuseUndecodable(const QByteArray &data, const Cadenza::Platform::MessagePeer &peer);
    void enqueue(const QVariantMap &request);
    void cancelAll();
    QByteArray statusRecords() const;
    void runNext();
    void jobFinished(InstallationJob *job);
    void reply(const QVariantMap &request, qint32 completion, const QString &reason);
    void armIdleTimer();

    PackageCatalogue m_catalogue;
    Options m_options;
    InstallationJob::Places m_places;
    QNetworkAccessManager m_network;
    std::unique_ptr<Cadenza::Platform::LocalMessagePort> m_requestPort;
    std::unique_ptr<Cadenza::Platform::LocalMessagePort> m_livenessPort;
    QList<InstallationJob *> m_queue; ///< the running job first
    QTimer m_idleTimer;
};

} // namespace Quillond

#endif
