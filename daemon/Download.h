#ifndef QUILLOND_DOWNLOAD_H
#define QUILLOND_DOWNLOAD_H

#include <QCryptographicHash>
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
 * resumed with a range request when the connection drops. Progress is reported as it goes.
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

    /// How many times an interrupted HTTP transfer is resumed before the next source is tried.
    static constexpr int MaximumResumes = 5;

Q_SIGNALS:
    void progressed(quint64 received);
    void finished(bool succeeded);

private:
    void tryNextSource();
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
    int m_resumes = 0;
    bool m_rangeRequested = false; ///< until the first answer to a resumed request
    bool m_done = false;
};

} // namespace Quillond

#endif
