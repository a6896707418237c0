// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PocketsphinxEnginePlugin.h"

#include "PocketsphinxDecoder.h"
#include "PocketsphinxModelCheck.h"

#include "core/files/Paths.h"
#include "core/services/IsolatedRun.h"

#include <QCryptographicHash>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QMutex>
#include <QSaveFile>

#include <sys/stat.h>

#include <cstdarg>
#include <cstdio>

#include <pocketsphinx.h>
#include <sphinxbase/err.h>

namespace Cadenza::Engines {

namespace {

/// The last error pocketsphinx reported on this thread, to explain a failed load.
thread_local QByteArray lastError;

/**
 * pocketsphinx logs every step of a load on standard error, and a command's output must stay clean:
 * only errors are kept. A fatal error ends the process inside the library, so that one is printed
 * before it does.
 */
void logMessage(void *, err_lvl_t level, const char *format, ...)
{
    if (level < ERR_ERROR) {
        return;
    }
    char text[1024];
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    lastError = QByteArray(text).trimmed();
    if (Platform::IsolatedRun::inCopy()) {
        Platform::IsolatedRun::report(lastError.constData());
        return;
    }
    if (level == ERR_FATAL) {
        std::fprintf(stderr, "pocketsphinx cannot go on with this model: %s\n", lastError.constData());
    }
}

void silenceLog()
{
    static QMutex mutex;
    static bool done = false;
    QMutexLocker locker(&mutex);
    if (!done) {
        // Without a log file the configuration table is not printed; messages still reach the callback.
        err_set_logfp(nullptr);
        err_set_callback(&logMessage, nullptr);
        done = true;
    }
}

cmd_ln_t *configuration(const PocketsphinxModelFiles &files)
{
    const QByteArray hmm = QFile::encodeName(files.acousticModel);
    const QByteArray lm = QFile::encodeName(files.languageModel);
    const QByteArray dict = QFile::encodeName(files.dictionary);
    return cmd_ln_init(nullptr, ps_args(), TRUE, "-hmm", hmm.constData(), "-lm", lm.constData(), "-dict",
        dict.constData(), nullptr);
}

/// What identifies the contents of the model's files: any write changes a file's change time.
QByteArray identity(const PocketsphinxModelFiles &files)
{
    QStringList paths {files.languageModel, files.dictionary};
    QDirIterator acoustic(files.acousticModel, QDir::Files);
    while (acoustic.hasNext()) {
        paths.append(acoustic.next());
    }
    paths.sort();
    QCryptographicHash hash(QCryptographicHash::Sha256);
    for (const QString &path : std::as_const(paths)) {
        struct stat status
        {
        };
        const QByteArray name = QFile::encodeName(QFileInfo(path).canonicalFilePath());
        if (::stat(name.constData(), &status) != 0) {
            return {};
        }
        hash.addData(name);
        hash.addData(QByteArray(QByteArray::number(qulonglong(status.st_dev)) + ' '
            + QByteArray::number(qulonglong(status.st_ino)) + ' '
            + QByteArray::number(qlonglong(status.st_size)) + ' '
            + QByteArray::number(qlonglong(status.st_mtim.tv_sec)) + '.'
            + QByteArray::number(qlonglong(status.st_mtim.tv_nsec)) + ' '
            + QByteArray::number(qlonglong(status.st_ctim.tv_sec)) + '.'
            + QByteArray::number(qlonglong(status.st_ctim.tv_nsec)) + '\n'));
    }
    return hash.result().toHex();
}

/**
 * Whether pocketsphinx can load the model without ending the process. pocketsphinx ends the process
 * it runs in (exit, abort, or a crash) on many kinds of damage, and reading a model's every table
 * ahead of it would mean writing its loader again; so the first load of each set of files is tried
 * in a copy of the process. The verdict is kept (by the files' identity) in the cache folder, so
 * later loads of unchanged files cost nothing extra.
 */
bool loadsSafely(const PocketsphinxModelFiles &files, QString *reason)
{
    const QByteArray key = identity(files);
    const QString verdictPath
        = Platform::Paths::cacheFolder() + QStringLiteral("/recognizer-checks/") + QString::fromLatin1(key);
    if (!key.isEmpty()) {
        QFile verdict(verdictPath);
        if (verdict.open(QIODevice::ReadOnly)) {
            const QByteArray content = verdict.readAll();
            if (content == "loads\n") {
                return true;
            }
            if (content.startsWith("fails\n")) {
                *reason = QString::fromUtf8(content.mid(6)).trimmed();
                return false;
            }
        }
    }
    silenceLog();
    const auto outcome = Platform::IsolatedRun::run(
        [&files] {
            cmd_ln_t *config = configuration(files);
            ps_decoder_t *decoder = config ? ps_init(config) : nullptr;
            return decoder != nullptr;
        },
        120000);
    if (!key.isEmpty() && !outcome.reason.startsWith(QStringLiteral("it took longer"))) {
        QDir().mkpath(QFileInfo(verdictPath).path());
        QSaveFile verdict(verdictPath);
        if (verdict.open(QIODevice::WriteOnly)) {
            verdict.write(
                outcome.succeeded ? QByteArray("loads\n") : "fails\n" + outcome.reason.toUtf8() + '\n');
            (void)verdict.commit();
        }
    }
    if (!outcome.succeeded) {
        *reason = outcome.reason;
    }
    return outcome.succeeded;
}

} // namespace

bool PocketsphinxEnginePlugin::checkModel(const Platform::RecognizerModel &model, QString *reason) const
{
    PocketsphinxModelFiles files;
    return files.resolve(model, reason);
}

std::unique_ptr<Platform::RecognitionDecoder> PocketsphinxEnginePlugin::load(
    const Platform::RecognizerModel &model, QString *error)
{
    PocketsphinxModelFiles files;
    if (!files.resolve(model, error)) {
        return nullptr;
    }
    QString reason;
    if (!loadsSafely(files, &reason)) {
        *error = QStringLiteral("pocketsphinx could not load the model of %1 (damaged files?): %2")
                     .arg(model.bundlePath, reason);
        return nullptr;
    }
    silenceLog();
    cmd_ln_t *config = configuration(files);
    if (!config) {
        *error = QStringLiteral("the model of %1 has settings pocketsphinx does not accept")
                     .arg(model.bundlePath);
        return nullptr;
    }
    lastError.clear();
    ps_decoder_t *decoder = ps_init(config);
    cmd_ln_free_r(config); // the decoder keeps its own reference
    if (!decoder) {
        *error = QStringLiteral("pocketsphinx could not load the model of %1 (damaged files?)")
                     .arg(model.bundlePath);
        if (!lastError.isEmpty()) {
            *error += QStringLiteral(": ") + QString::fromUtf8(lastError);
        }
        return nullptr;
    }
    return std::make_unique<PocketsphinxDecoder>(decoder);
}

} // namespace Cadenza::Engines
