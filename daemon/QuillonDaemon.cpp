// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "QuillonDaemon.h"

#include "RequestCheck.h"

#include "core/files/Paths.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/MessagePort.h"
#include "core/services/Services.h"
#include "core/services/UnixMessagePortService.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/KeyedArchive.h"
#include "protocol/SecureArchiving.h"
#include "quillond_logging.h"

#include <QDir>

namespace Quillond {

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;

namespace {

bool isString(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    return v.typeId() == QMetaType::QString && !v.toString().isEmpty();
}

} // namespace

QuillonDaemon::QuillonDaemon(PackageCatalogue catalogue, Options options, QObject *parent)
    : QObject(parent)
    , m_catalogue(std::move(catalogue))
    , m_options(std::move(options))
    , m_places(defaultPlaces())
{
    m_idleTimer.setSingleShot(true);
    connect(&m_idleTimer, &QTimer::timeout, this, [this] {
        if (m_queue.isEmpty()) {
            Q_EMIT idle();
        }
    });
}

QuillonDaemon::~QuillonDaemon()
{
    stop();
}

InstallationJob::Places QuillonDaemon::defaultPlaces()
{
    return {Platform::Paths::userVoicesFolder(), Platform::Paths::userRecognizersFolder(),
        Platform::Paths::cacheFolder() + QStringLiteral("/downloads")};
}

void QuillonDaemon::removeLeftovers(const InstallationJob::Places &places)
{
    for (const QString &folder : {places.voicesFolder, places.recognizersFolder}) {
        const QStringList staging
            = QDir(folder).entryList({InstallationJob::StagingPrefix + QLatin1Char('*')},
                QDir::Dirs | QDir::Hidden | QDir::NoDotAndDotDot);
        for (const QString &name : staging) {
            qCInfo(lcDaemon, "Removing %s left by an interrupted installation", qPrintable(name));
            QDir(folder + QLatin1Char('/') + name).removeRecursively();
        }
    }
    const QStringList partial
        = QDir(places.downloadsFolder).entryList({QStringLiteral("*.part")}, QDir::Files | QDir::Hidden);
    for (const QString &name : partial) {
        QFile::remove(places.downloadsFolder + QLatin1Char('/') + name);
    }
}

bool QuillonDaemon::start(QString *error)
{
    removeLeftovers(m_places);
    auto handler = [this](qint32 id, const QByteArray &data, const Platform::MessagePeer &peer) {
        return handle(id, data, peer);
    };
    auto &ports = Platform::Services::messagePorts();
    if (m_options.requestPortDescriptor >= 0) {
        auto *unixPorts = dynamic_cast<Platform::UnixMessagePortService *>(&ports);
        if (unixPorts) {
            m_requestPort
                = unixPorts->adoptLocalPort(ServicePortName, m_options.requestPortDescriptor, handler);
        }
    } else {
        m_requestPort = ports.createLocalPort(ServicePortName, handler);
    }
    if (!m_requestPort) {
        *error = QStringLiteral("cannot open the request port %1 (is another quillond running?)")
                     .arg(ServicePortName);
        return false;
    }
    // Held only while the daemon runs: clients probe it to know whether anybody answers.
    m_livenessPort = ports.createPresencePort(LivenessPortName);
    if (!m_livenessPort) {
        m_requestPort.reset();
        *error = QStringLiteral("cannot open the liveness port %1").arg(LivenessPortName);
        return false;
    }
    qCInfo(lcDaemon, "quillond is serving %lld packages", static_cast<long long>(m_catalogue.size()));
    armIdleTimer();
    return true;
}

void QuillonDaemon::stop()
{
    cancelAll();
    qDeleteAll(std::exchange(m_queue, {}));
    m_livenessPort.reset();
    m_requestPort.reset();
}

void QuillonDaemon::armIdleTimer()
{
    if (m_options.idleExitSeconds > 0 && m_queue.isEmpty()) {
        m_idleTimer.start(m_options.idleExitSeconds * 1000);
    }
}

std::optional<QByteArray> QuillonDaemon::handle(
    qint32 messageId, const QByteArray &data, const Platform::MessagePeer &peer)
{
    switch (messageId) {
    case StartInstallingMessage: {
        const auto request = CZDecodeSecureDictionary(data);
        if (!request) {
            refuseUndecodable(data, peer);
            return std::nullopt;
        }
        enqueue(*request);
        return std::nullopt;
    }
    case CancelAllMessage:
        cancelAll();
        return std::nullopt;
    case ActiveInstallationsMessage:
        return statusRecords();
    case ShowProgressWindowMessage:
        qCInfo(lcDaemon, "quillond has no display to show progress on; 'cadenza status' shows it");
        return std::nullopt;
    default:
        qCWarning(lcDaemon, "Ignoring unknown message %d from process %lld", int(messageId),
            static_cast<long long>(peer.processId));
        return std::nullopt;
    }
}

void QuillonDaemon::refuseUndecodable(const QByteArray &data, const Platform::MessagePeer &peer)
{
    // Read once more, allowing what a request may not hold, only to find where to say no.
    using Platform::ArchiveClass;
    using Platform::ArchiveClasses;
    QString why;
    (void)Platform::KeyedArchive::decode(
        data, ArchiveClasses(ArchiveClass::Dictionary) | Platform::PropertyListLeaves, &why);
    const auto lenient = Platform::KeyedArchive::decode(
        data, ArchiveClasses(ArchiveClass::Array) | ArchiveClass::Dictionary | Platform::PropertyListLeaves);
    if (!lenient || lenient->typeId() != QMetaType::QVariantMap) {
        qCWarning(lcDaemon, "Ignoring an installation request from process %lld that does not decode",
            static_cast<long long>(peer.processId));
        return;
    }
    const QVariantMap request = lenient->toMap();
    QString problem = RequestCheck::problemWith(request);
    if (problem.isEmpty()) {
        problem = QStringLiteral("the request does not decode: %1").arg(why);
    }
    qCWarning(lcDaemon, "Refusing an installation request: %s", qPrintable(problem));
    reply(request, FailedCompletion, problem);
}

void QuillonDaemon::enqueue(const QVariantMap &request)
{
    // Every request that names a port it can be answered on gets an answer, a refusal included.
    if (const QString problem = RequestCheck::problemWith(request); !problem.isEmpty()) {
        qCWarning(lcDaemon, "Refusing an installation request: %s", qPrintable(problem));
        reply(request, FailedCompletion, problem);
        return;
    }
    const QString tag = request.value(TagNameKey).toString();
    const auto package = m_catalogue.package(tag);
    if (!package) {
        reply(request, FailedCompletion, QStringLiteral("unknown tag %1").arg(tag.left(200)));
        return;
    }
    if (m_queue.size() >= m_options.maximumQueuedRequests) {
        reply(request, FailedCompletion, QStringLiteral("too many requests are waiting"));
        return;
    }
    // The client's own fields are kept only where they cannot mislead: the rest comes from the catalogue.
    QVariantMap record = request;
    if (!isString(record, ItemNameKey)) {
        record.insert(ItemNameKey, package->bundleName.section(QLatin1Char('.'), 0, 0));
    }
    record.insert(ObjectIDKey,
        package->objectIdentifier.isEmpty() ? request.value(ObjectIDKey) : package->objectIdentifier);
    record.insert(ItemByteSizeKey, QVariant::fromValue<quint64>(package->byteSize));
    auto *job = new InstallationJob(record, *package, m_options.repositories, m_places, &m_network, this);
    job->setRetryWindow(m_options.retryWindowMilliseconds);
    job->setFileRate(m_options.fileRate);
    connect(job, &InstallationJob::started, this, [this, job] {
        Platform::Services::notifications().postNotification(
            StartedInstallationNotification, QString(), {{ObjectIDKey, job->request().value(ObjectIDKey)}});
    });
    connect(
        job, &InstallationJob::finished, this, [this, job] { jobFinished(job); }, Qt::QueuedConnection);
    m_queue.append(job);
    m_idleTimer.stop();
    qCInfo(lcDaemon, "Queued %s (%lld waiting)", qPrintable(tag), static_cast<long long>(m_queue.size()));
    if (m_queue.size() == 1) {
        runNext();
    }
}

void QuillonDaemon::runNext()
{
    if (!m_queue.isEmpty() && m_queue.first()->phase() == InstallationJob::Phase::Waiting) {
        m_queue.first()->start();
    }
}

void QuillonDaemon::cancelAll()
{
    const auto jobs = m_queue;
    for (InstallationJob *job : jobs) {
        job->cancel();
    }
}

void QuillonDaemon::jobFinished(InstallationJob *job)
{
    const qsizetype index = m_queue.indexOf(job);
    if (index < 0) {
        return;
    }
    m_queue.removeAt(index);
    const qint32 completion = job->outcome() == InstallationJob::Outcome::Installed ? InstalledCompletion
        : job->outcome() == InstallationJob::Outcome::Cancelled                     ? CancelledCompletion
                                                                                    : FailedCompletion;
    reply(job->request(), completion, job->failureReason());
    if (job->phase() == InstallationJob::Phase::Finished
        && job->outcome() != InstallationJob::Outcome::None) {
        Platform::Services::notifications().postNotification(
            FinishedInstallationNotification, QString(), {{ObjectIDKey, job->request().value(ObjectIDKey)}});
    }
    job->deleteLater();
    runNext();
    armIdleTimer();
}

void QuillonDaemon::reply(const QVariantMap &request, qint32 completion, const QString &reason)
{
    const QString portName = request.value(ClientPortNameKey).toString();
    if (request.value(ClientPortNameKey).typeId() != QMetaType::QString
        || !RequestCheck::isClientPortName(portName)) {
        return; // nowhere to answer
    }
    auto port = Platform::Services::messagePorts().createRemotePort(portName);
    if (!port) {
        qCInfo(lcDaemon, "Client port %s is gone; nobody to tell", qPrintable(portName));
        return;
    }
    // Only strings go back: a client's odd value must not make the answer undecodable.
    QVariantMap answer;
    for (const QString &key : {TagNameKey, ObjectIDKey}) {
        if (const QVariant value = RequestCheck::echoable(request.value(key)); value.isValid()) {
            answer.insert(key, value);
        }
    }
    if (!reason.isEmpty() && completion == FailedCompletion) {
        answer.insert(FailureReasonKey, reason);
    }
    // A client that does not read is not waited for long.
    const auto result = port->sendRequest(completion, CZEncodeSecureObject(answer), 2.0, 0.0, false);
    if (result.status != Platform::MessagePortStatus::Success) {
        qCInfo(lcDaemon, "Could not tell %s: status %d", qPrintable(portName), result.status);
    }
}

QByteArray QuillonDaemon::statusRecords() const
{
    QList<QByteArray> records;
    records.reserve(m_queue.size());
    for (const InstallationJob *job : m_queue) {
        if (job->phase() != InstallationJob::Phase::Finished) {
            if (QByteArray record = job->archivedStatusRecord(); !record.isEmpty()) {
                records.append(std::move(record));
            }
        }
    }
    return Cadenza::Platform::KeyedArchive::encodeArray(records);
}

} // namespace Quillond
