// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PocketsphinxEnginePlugin.h"

#include "PocketsphinxDecoder.h"
#include "PocketsphinxModelCheck.h"

#include <QFile>
#include <QMutex>

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
    silenceLog();
    const QByteArray hmm = QFile::encodeName(files.acousticModel);
    const QByteArray lm = QFile::encodeName(files.languageModel);
    const QByteArray dict = QFile::encodeName(files.dictionary);
    cmd_ln_t *config = cmd_ln_init(nullptr, ps_args(), TRUE, "-hmm", hmm.constData(), "-lm", lm.constData(),
        "-dict", dict.constData(), nullptr);
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
