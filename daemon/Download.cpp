// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "Download.h"

#include "quillond_logging.h"

#include <QFutureWatcher>
#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QThread>
#include <QtConcurrent/QtConcurrentRun>

namespace Quillond {

namespace {
constexpr qint64 ChunkSize = 1 << 20;
constexpr qint64 MinimumPauseMilliseconds = 250;
} // namespace

Download::Download(QList<QUrl> sources, QString destination, quint64 expectedSize,
    QNetworkAccessManager *network, QObject *parent)
    : QObject(parent)
    , m_sources(std::move(sources))
    , m_destination(std::move(destination))
    , m_expectedSize(expectedSize)
    , m_network(network)
    , m_cancelled(std::make_shared<std::atomic<bool>>(false))
{
    m_progressTimer.setInterval(100);
    m_retryTimer.setSingleShot(true);
    connect(&m_retryTimer, &QTimer::timeout, this, [this] {
        m_nextSource = 0;
        m_roundHadTransientFailure = false;
        tryNextSource();
    });
    connect(&m_progressTimer, &QTimer::timeout, this, [this] { Q_EMIT progressed(m_received.load()); });
}

Download::~Download()
{
    m_cancelled->store(true);
    if (m_reply) {
        m_reply->abort();
    }
    m_copy.waitForFinished();
}

void Download::start()
{
    m_file.setFileName(m_destination);
    if (!m_file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
        fail(Failure::Disk,
            QStringLiteral("disk: cannot write %1: %2").arg(m_destination, m_file.errorString()));
        return;
    }
    m_hash = std::make_unique<QCryptographicHash>(QCryptographicHash::Sha256);
    m_received = 0;
    tryNextSource();
}

void Download::cancel()
{
    m_cancelled->store(true);
    if (m_reply) {
        m_reply->abort();
    }
    if (m_retryTimer.isActive()) {
        m_retryTimer.stop();
        fail(Failure::Cancelled, QStringLiteral("cancelled"));
    }
}

void Download::madeProgress()
{
    m_outage.invalidate();
    m_pauses = 0;
}

void Download::endOfRound()
{
    if (!m_roundHadTransientFailure) {
        fail(Failure::Network,
            QStringLiteral("network: no source delivered the file (%1)")
                .arg(m_lastSourceError.isEmpty() ? QStringLiteral("no sources") : m_lastSourceError));
        return;
    }
    // Every source failed in a way that may pass (no connection, a server error): wait and try them
    // all again, with growing pauses, until the window is spent.
    if (!m_outage.isValid()) {
        m_outage.start();
    }
    const qint64 left = m_retryWindow - m_outage.elapsed();
    const int pause = int(qMin<qint64>(qMin(1000 << qMin(m_pauses, 4), 15000), left));
    if (left < MinimumPauseMilliseconds) { // no room left for one more real attempt
        fail(Failure::Network,
            QStringLiteral(
                "network: no source answered for %1 s; the download stopped at %2 of %3 bytes (%4)")
                .arg(qMax<qint64>(1, qRound64(double(m_outage.elapsed()) / 1000.0)))
                .arg(m_received.load())
                .arg(m_expectedSize)
                .arg(m_lastSourceError));
        return;
    }
    ++m_pauses;
    qCInfo(lcDownload, "No source answers (%s); trying again in %d ms", qPrintable(m_lastSourceError), pause);
    m_retryTimer.start(pause);
}

void Download::tryNextSource()
{
    if (m_cancelled->load()) {
        fail(Failure::Cancelled, QStringLiteral("cancelled"));
        return;
    }
    if (m_nextSource >= m_sources.size()) {
        endOfRound();
        return;
    }
    m_current = m_sources.at(m_nextSource++);
    if (m_current.isLocalFile()) {
        // A local copy starts from the beginning: it is fast, and has no ranges.
        m_received = 0;
        m_hash->reset();
        copyLocalFile(m_current.toLocalFile());
    } else if (m_current.scheme() == u"http" || m_current.scheme() == u"https") {
        // The bytes fetched so far, from whichever source, are kept: every source serves the same file.
        fetch(true);
    } else {
        m_lastSourceError = QStringLiteral("unsupported source %1").arg(m_current.toDisplayString());
        tryNextSource();
    }
}

void Download::copyLocalFile(const QString &path)
{
    m_file.close(); // the worker opens its own handles; reopened if the next source is fetched
    m_progressTimer.start();
    auto cancelled = m_cancelled;
    const QString destination = m_destination;
    const quint64 limit = m_expectedSize;
    auto *received = &m_received;
    auto *hash = m_hash.get();
    const qint64 rate = m_fileRate;
    auto result = std::make_shared<std::pair<Failure, QString>>(Failure::None, QString());
    m_copy = QtConcurrent::run([=] {
        QFile in(path);
        QFile out(destination);
        if (!in.open(QIODevice::ReadOnly)) {
            *result = {Failure::Network, QStringLiteral("cannot read %1: %2").arg(path, in.errorString())};
            return;
        }
        if (!out.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
            *result = {Failure::Disk,
                QStringLiteral("disk: cannot write %1: %2").arg(destination, out.errorString())};
            return;
        }
        // Limited, it goes in tenths of a second's worth, so that progress shows as it goes.
        QByteArray buffer(rate > 0 ? qBound<qint64>(1, rate / 10, ChunkSize) : ChunkSize, Qt::Uninitialized);
        QElapsedTimer clock;
        clock.start();
        while (true) {
            if (rate > 0) {
                const qint64 due = qint64(received->load()) * 1000 / rate;
                while (clock.elapsed() < due && !cancelled->load()) {
                    QThread::msleep(quint64(qMin<qint64>(50, due - clock.elapsed())));
                }
            }
            if (cancelled->load()) {
                *result = {Failure::Cancelled, QStringLiteral("cancelled")};
                return;
            }
            const qint64 n = in.read(buffer.data(), buffer.size());
            if (n < 0) {
                *result
                    = {Failure::Network, QStringLiteral("cannot read %1: %2").arg(path, in.errorString())};
                return;
            }
            if (n == 0) {
                break;
            }
            if (received->load() + quint64(n) > limit) {
                *result
                    = {Failure::TooLarge, QStringLiteral("size: the file is larger than the catalogue says")};
                return;
            }
            hash->addData(QByteArrayView(buffer.constData(), n));
            if (out.write(buffer.constData(), n) != n) {
                *result = {Failure::Disk,
                    QStringLiteral("disk: cannot write %1: %2").arg(destination, out.errorString())};
                return;
            }
            received->fetch_add(quint64(n));
        }
        if (!out.flush()) {
            *result = {Failure::Disk, QStringLiteral("disk: cannot write %1").arg(destination)};
        }
    });
    auto *watcher = new QFutureWatcher<void>(this);
    connect(watcher, &QFutureWatcher<void>::finished, this, [this, watcher, result, path] {
        watcher->deleteLater();
        m_progressTimer.stop();
        Q_EMIT progressed(m_received.load());
        if (result->first == Failure::None) {
            succeed();
        } else if (result->first == Failure::Network) {
            m_lastSourceError = result->second;
            if (!m_file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
                fail(Failure::Disk,
                    QStringLiteral("disk: cannot write %1: %2").arg(m_destination, m_file.errorString()));
                return;
            }
            m_received = 0;
            m_hash->reset();
            tryNextSource();
        } else {
            fail(result->first, result->second);
        }
    });
    watcher->setFuture(m_copy);
}

void Download::fetch(bool resume)
{
    QNetworkRequest request(m_current);
    request.setAttribute(QNetworkRequest::RedirectPolicyAttribute, QNetworkRequest::NoLessSafeRedirectPolicy);
    request.setTransferTimeout(30000);
    m_replyDelivered = false;
    m_rangeRequested = resume && m_received.load() > 0;
    if (m_rangeRequested) {
        request.setRawHeader("Range", "bytes=" + QByteArray::number(m_received.load()) + '-');
    }
    m_reply = m_network->get(request);
    connect(m_reply, &QNetworkReply::readyRead, this, &Download::onReadyRead);
    connect(m_reply, &QNetworkReply::finished, this, &Download::onReplyFinished);
}

void Download::onReadyRead()
{
    if (!m_reply) {
        return;
    }
    const int status = m_reply->attribute(QNetworkRequest::HttpStatusCodeAttribute).toInt();
    if (m_rangeRequested && status == 200) {
        // The server ignored the range: start the file again.
        m_file.resize(0);
        m_file.seek(0);
        m_hash->reset();
        m_received = 0;
    }
    m_rangeRequested = false;
    if (status != 200 && status != 206) {
        return; // an error page; onReplyFinished deals with it
    }
    const QByteArray data = m_reply->readAll();
    if (m_received.load() + quint64(data.size()) > m_expectedSize) {
        fail(Failure::TooLarge, QStringLiteral("size: the file is larger than the catalogue says"));
        return;
    }
    m_hash->addData(data);
    if (m_file.write(data) != data.size()) {
        fail(Failure::Disk,
            QStringLiteral("disk: cannot write %1: %2").arg(m_destination, m_file.errorString()));
        return;
    }
    m_received.fetch_add(quint64(data.size()));
    if (!data.isEmpty()) {
        madeProgress();
        m_replyDelivered = true;
    }
    Q_EMIT progressed(m_received.load());
}

void Download::onReplyFinished()
{
    QNetworkReply *reply = m_reply;
    if (!reply || m_done) {
        return;
    }
    // The last bytes may still sit in the reply: finished() does not wait for readyRead().
    onReadyRead();
    if (m_done) {
        return;
    }
    m_reply = nullptr;
    reply->deleteLater();
    if (m_cancelled->load()) {
        fail(Failure::Cancelled, QStringLiteral("cancelled"));
        return;
    }
    const int status = reply->attribute(QNetworkRequest::HttpStatusCodeAttribute).toInt();
    // A connection that closed early can look like a complete answer; the catalogue's size says not.
    const bool shortAnswer = m_received.load() < m_expectedSize;
    if (reply->error() == QNetworkReply::NoError && (status == 200 || status == 206) && !shortAnswer) {
        succeed();
        return;
    }
    // A dropped connection, a refused one or a server error may pass; a missing file or a refusal
    // will not.
    const QNetworkReply::NetworkError error = reply->error();
    const bool connectionLost
        = (error != QNetworkReply::NoError && error < QNetworkReply::ContentAccessDenied)
        || error == QNetworkReply::ProxyConnectionRefusedError || error == QNetworkReply::ProxyTimeoutError
        || (error == QNetworkReply::NoError && shortAnswer);
    const bool transient = connectionLost || status >= 500 || status == 408 || status == 429;
    m_lastSourceError = status
        ? QStringLiteral("%1 answered HTTP %2").arg(m_current.toDisplayString()).arg(status)
        : QStringLiteral("%1: %2").arg(m_current.toDisplayString(), reply->errorString());
    if (transient && std::exchange(m_replyDelivered, false)) {
        // It was delivering: resume where it stopped, at once.
        qCInfo(lcDownload, "Resuming %s at byte %llu", qPrintable(m_current.toDisplayString()),
            static_cast<unsigned long long>(m_received.load()));
        --m_nextSource;
        tryNextSource();
        return;
    }
    m_roundHadTransientFailure = m_roundHadTransientFailure || transient;
    tryNextSource();
}

void Download::fail(Failure failure, const QString &text)
{
    if (m_done) {
        return;
    }
    m_done = true;
    m_failure = failure;
    m_error = text;
    m_progressTimer.stop();
    if (m_reply) {
        m_reply->disconnect(this);
        m_reply->abort();
    }
    m_file.close();
    QFile::remove(m_destination);
    Q_EMIT finished(false);
}

void Download::succeed()
{
    if (m_done) {
        return;
    }
    m_done = true;
    if (m_file.isOpen() && !m_file.flush()) {
        m_done = false;
        fail(Failure::Disk, QStringLiteral("disk: cannot write %1").arg(m_destination));
        return;
    }
    m_file.close();
    m_digest = m_hash->result();
    Q_EMIT finished(true);
}

} // namespace Quillond
