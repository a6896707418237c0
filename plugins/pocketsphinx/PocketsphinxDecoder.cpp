// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PocketsphinxDecoder.h"

#include <QFile>
#include <QFileInfo>

#include <pocketsphinx.h>

namespace Cadenza::Engines {

namespace {
constexpr char GrammarSearch[] = "cadenza-grammar";
} // namespace

PocketsphinxDecoder::PocketsphinxDecoder(ps_decoder_s *decoder)
    : m_decoder(decoder)
    , m_dictationSearch(ps_get_search(decoder))
{ }

PocketsphinxDecoder::~PocketsphinxDecoder()
{
    if (m_inUtterance) {
        ps_end_utt(m_decoder);
    }
    ps_free(m_decoder);
}

bool PocketsphinxDecoder::begin(const QString &grammarFile, QString *error)
{
    if (m_inUtterance) {
        ps_end_utt(m_decoder);
        m_inUtterance = false;
    }
    if (grammarFile.isEmpty()) {
        if (ps_set_search(m_decoder, m_dictationSearch.constData()) < 0) {
            *error = QStringLiteral("the language model cannot be used");
            return false;
        }
    } else {
        const QString absolute = QFileInfo(grammarFile).absoluteFilePath();
        if (absolute != m_grammarFile) {
            if (!QFileInfo(absolute).isFile()) {
                *error = QStringLiteral("the grammar %1 does not exist").arg(grammarFile);
                return false;
            }
            if (ps_set_jsgf_file(m_decoder, GrammarSearch, QFile::encodeName(absolute).constData()) < 0) {
                m_grammarFile.clear();
                *error
                    = QStringLiteral("the grammar %1 is not a JSGF grammar this model can use (are all its "
                                     "words in the dictionary?)")
                          .arg(grammarFile);
                return false;
            }
            m_grammarFile = absolute;
        }
        if (ps_set_search(m_decoder, GrammarSearch) < 0) {
            *error = QStringLiteral("the grammar %1 cannot be used").arg(grammarFile);
            return false;
        }
    }
    if (ps_start_utt(m_decoder) < 0) {
        *error = QStringLiteral("the decoder cannot start an utterance");
        return false;
    }
    m_inUtterance = true;
    return true;
}

bool PocketsphinxDecoder::process(const qint16 *samples, qsizetype count, QString *error)
{
    if (!m_inUtterance) {
        *error = QStringLiteral("no utterance has begun");
        return false;
    }
    if (ps_process_raw(m_decoder, samples, size_t(count), FALSE, FALSE) < 0) {
        *error = QStringLiteral("the decoder rejected the audio");
        return false;
    }
    return true;
}

QString PocketsphinxDecoder::partialResult()
{
    const char *hypothesis = m_inUtterance ? ps_get_hyp(m_decoder, nullptr) : nullptr;
    return hypothesis ? QString::fromUtf8(hypothesis) : QString();
}

std::optional<QString> PocketsphinxDecoder::end(QString *error)
{
    if (!m_inUtterance) {
        *error = QStringLiteral("no utterance has begun");
        return std::nullopt;
    }
    m_inUtterance = false;
    if (ps_end_utt(m_decoder) < 0) {
        *error = QStringLiteral("the decoder could not finish the utterance");
        return std::nullopt;
    }
    const char *hypothesis = ps_get_hyp(m_decoder, nullptr);
    return hypothesis ? QString::fromUtf8(hypothesis).simplified() : QString();
}

} // namespace Cadenza::Engines
