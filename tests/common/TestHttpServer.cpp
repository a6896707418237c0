// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestHttpServer.h"

#include <QDir>
#include <QFile>
#include <QPointer>
#include <QRegularExpression>
#include <QTcpSocket>
#include <QTimer>

#include <algorithm>

namespace Cadenza::Testing {

TestHttpServer::TestHttpServer(QString root, QObject *parent)
    : QObject(parent)
    , m_root(std::move(root))
{
    connect(&m_server, &QTcpServer::newConnection, this, [this] {
        while (QTcpSocket *socket = m_server.nextPendingConnection()) {
            connect(socket, &QTcpSocket::readyRead, this, [this, socket] { serve(socket); });
            connect(socket, &QTcpSocket::disconnected, socket, &QObject::deleteLater);
        }
    });
}

bool TestHttpServer::listen(quint16 port)
{
    if (!m_server.listen(QHostAddress::LocalHost, port ? port : m_port)) {
        return false;
    }
    m_port = m_server.serverPort();
    return true;
}

void TestHttpServer::close()
{
    m_server.close();
    for (QTcpSocket *socket : m_server.findChildren<QTcpSocket *>()) {
        socket->abort();
    }
}

QUrl TestHttpServer::baseUrl() const
{
    return QUrl(QStringLiteral("http://127.0.0.1:%1/").arg(m_port));
}

void TestHttpServer::serve(QTcpSocket *socket)
{
    QByteArray request = socket->property("request").toByteArray() + socket->readAll();
    if (!request.contains("\r\n\r\n")) {
        socket->setProperty("request", request);
        return;
    }
    socket->setProperty("request", QByteArray());
    ++m_requests;
    const QList<QByteArray> lines = request.split('\n');
    const QList<QByteArray> first = lines.value(0).trimmed().split(' ');
    const QString path = QString::fromLatin1(first.value(1));
    qint64 from = 0;
    static const QRegularExpression range(
        QStringLiteral("^range:\\s*bytes=(\\d+)-\\s*$"), QRegularExpression::CaseInsensitiveOption);
    for (const QByteArray &line : lines) {
        const auto match = range.match(QString::fromLatin1(line.trimmed()));
        if (match.hasMatch()) {
            from = match.captured(1).toLongLong();
            ++m_rangeRequests;
        }
    }
    auto file = std::make_shared<QFile>(QDir(m_root).filePath(QDir::cleanPath(path).mid(1)));
    if (first.value(0) != "GET" || path.contains(QStringLiteral("..")) || !file->open(QIODevice::ReadOnly)) {
        socket->write("HTTP/1.1 404 Not Found\r\nContent-Length: 0\r\nConnection: close\r\n\r\n");
        socket->disconnectFromHost();
        return;
    }
    const qint64 size = file->size();
    if (from > size) {
        socket->write("HTTP/1.1 416 Range Not Satisfiable\r\nContent-Length: 0\r\nConnection: close\r\n\r\n");
        socket->disconnectFromHost();
        return;
    }
    file->seek(from);
    QByteArray header
        = from > 0 ? QByteArray("HTTP/1.1 206 Partial Content\r\n") : QByteArray("HTTP/1.1 200 OK\r\n");
    header += "Content-Length: " + QByteArray::number(size - from) + "\r\n";
    if (from > 0) {
        header += "Content-Range: bytes " + QByteArray::number(from) + '-' + QByteArray::number(size - 1)
            + '/' + QByteArray::number(size) + "\r\n";
    }
    header += "Accept-Ranges: bytes\r\nConnection: close\r\n\r\n";
    socket->write(header);

    const qint64 dropAfter = std::exchange(m_dropAfter, -1);
    // Throttled: a tenth of a second's bytes every tenth of a second, so small files trickle too.
    // With a transfer time, each file's rate follows from its size, so large and small files last alike.
    const qint64 rate = m_secondsPerTransfer > 0
        ? qMax<qint64>(1, qint64((size - from) / m_secondsPerTransfer))
        : m_bytesPerSecond;
    const qint64 chunk = rate > 0 ? std::clamp<qint64>(rate / 10, 1, 64 * 1024) : 64 * 1024;
    const int interval = rate > 0 ? 100 : 0;
    auto *timer = new QTimer(socket);
    timer->setInterval(interval);
    auto sent = std::make_shared<qint64>(0);
    QPointer<QTcpSocket> guard(socket);
    connect(timer, &QTimer::timeout, socket, [guard, timer, file, sent, dropAfter, chunk] {
        if (!guard) {
            return;
        }
        if (guard->bytesToWrite() > 4 * chunk) {
            return; // let the client catch up
        }
        qint64 want = chunk;
        if (dropAfter >= 0) {
            want = qMin(want, dropAfter - *sent);
        }
        const QByteArray data = file->read(qMax<qint64>(0, want));
        if (!data.isEmpty()) {
            guard->write(data);
            *sent += data.size();
        }
        if (dropAfter >= 0 && *sent >= dropAfter) {
            timer->stop();
            guard->flush();
            guard->abort();
            return;
        }
        if (file->atEnd()) {
            timer->stop();
            guard->disconnectFromHost();
        }
    });
    timer->start();
}

} // namespace Cadenza::Testing
