// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_DOWNLOAD_H
#define QUILLOND_DOWNLOAD_H

#include <QCryptographicHash>
#include <QElapsedTimer>
#include <QFile>
#include <QFuture>
#include <QObject>
#include <QPointer>
#include <QTimer>
#include <QUrl>

#include <atomic>
#include <memory>

class QNetworkAccessManager;
class QNetworkReply;

namespace Quillond {

/**
 * Fetches one file from the first source that delivers it, hashing it with SHA-256 on the way.
 *
 * file:// sources are copied on a worker thread; http(s):// sources are fetched with Qt Network and
 * resumed with a range request when the connection drops. When no source answers (the network or the
 * servers are down), every source is tried again after growing pauses for as long as the retry window
 * allows, and the bytes already fetched are kept and resumed from. Progress is reported as it goes.
 */
class Download : public QObject
{
    Q_OBJECT
public:
    enum class Failure { None, Network, TooLarge, Disk, Cancelled };

    Download(QList<QUrl> sources, QString destination, quint64 expectedSize, QNetworkAccessManager *network,
        QObject *parent = nullptr);
    ~Download() override;

    void start();
    void cancel();

    [[nodiscard]] quint64 receivedBytes() const { return m_received.load(); }
    [[nodiscard]] QByteArray sha256() const { return m_digest; }
    [[nodiscard]] QString errorText() const { return m_error; }
    [[nodiscard]] Failure failure() const { return m_failure; }

    /// How long sources that do not answer are tried again before the download fails.
    static constexpr int DefaultRetryWindowMilliseconds = 60000;
    void setRetryWindow(int milliseconds) { m_retryWindow = milliseconds; }
    /// Copies file:// sources at most this many bytes a second (0: as fast as the disks go).
    void setFileRate(qint64 bytesPerSecond) { m_fileRate = bytesPerSecond; }

Q_SIGNALS:
    void progressed(quint64 received);
    void finished(bool succeeded);

private:
    void tryNextSource();
    void endOfRound();
    void madeProgress();
    void copyLocalFile(const QString &path);
    void fetch(bool resume);
    void onReadyRead();
    void onReplyFinished();
    void fail(Failure failure, const QString &text);
    void succeed();

    QList<QUrl> m_sources;
    qsizetype m_nextSource = 0;
    QUrl m_current;
    QString m_destination;
    quint64 m_expectedSize;
    QNetworkAccessManager *m_network;
    QPointer<QNetworkReply> m_reply;
    QFile m_file;
    std::unique_ptr<QCryptographicHash> m_hash;
    std::atomic<quint64> m_received {0};
    std::shared_ptr<std::atomic<bool>> m_cancelled;
    QFuture<void> m_copy;
    QTimer m_progressTimer;
    QByteArray m_digest;
    QString m_error;
    QString m_lastSourceError;
    Failure m_failure = Failure::None;
    int m_retryWindow = DefaultRetryWindowMilliseconds;
    qint64 m_fileRate = 0;
    QTimer m_retryTimer;
    QElapsedTimer m_outage; ///< since the last byte arrived, while no source delivers
    int m_pauses = 0; ///< pauses since the last byte arrived
    bool m_roundHadTransientFailure = false;
    bool m_replyDelivered = false; ///< the current reply brought bytes
    bool m_rangeRequested = false; ///< until the first answer to a resumed request
    bool m_done = false;
};

} // namespace Quillond

#endif
