// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_TESTHTTPSERVER_H
#define CADENZA_TESTS_TESTHTTPSERVER_H

#include <QObject>
#include <QString>
#include <QTcpServer>
#include <QUrl>

namespace Cadenza::Testing {

/**
 * A small HTTP/1.1 file server on 127.0.0.1 for tests: GET with byte ranges, an optional speed limit,
 * and an optional dropped connection part-way through, to exercise resuming.
 */
class TestHttpServer : public QObject
{
    Q_OBJECT
public:
    explicit TestHttpServer(QString root, QObject *parent = nullptr);

    /// Listens on 127.0.0.1, on @p port or, for 0, on the port it had before (a new one the first time).
    [[nodiscard]] bool listen(quint16 port = 0);
    /// Stops listening and cuts every connection, as a server that goes down does.
    void close();
    [[nodiscard]] QUrl baseUrl() const;

    /// Sends at most @p bytes per second (0: as fast as possible).
    void setBytesPerSecond(qint64 bytes) { m_bytesPerSecond = bytes; }
    /// Makes every transfer last about @p seconds, whatever the file's size (0: off).
    void setSecondsPerTransfer(double seconds) { m_secondsPerTransfer = seconds; }
    /// Drops the next transfer after @p bytes of its body.
    void dropNextTransferAfter(qint64 bytes) { m_dropAfter = bytes; }

    [[nodiscard]] int requestCount() const { return m_requests; }
    [[nodiscard]] int rangeRequestCount() const { return m_rangeRequests; }

private:
    void serve(QTcpSocket *socket);

    QString m_root;
    QTcpServer m_server;
    quint16 m_port = 0;
    qint64 m_bytesPerSecond = 0;
    double m_secondsPerTransfer = 0;
    qint64 m_dropAfter = -1;
    int m_requests = 0;
    int m_rangeRequests = 0;
};

} // namespace Cadenza::Testing

#endif
