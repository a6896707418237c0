// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLUGINS_POCKETSPHINXDECODER_H
#define CADENZA_PLUGINS_POCKETSPHINXDECODER_H

#include "core/engines/RecognitionEngine.h"

#include <QByteArray>

struct ps_decoder_s;

namespace Cadenza::Engines {

/// One loaded pocketsphinx decoder: the model stays in memory as long as the decoder lives.
class PocketsphinxDecoder final : public Platform::RecognitionDecoder
{
public:
    /// Takes ownership of @p decoder.
    explicit PocketsphinxDecoder(ps_decoder_s *decoder);
    ~PocketsphinxDecoder() override;
    PocketsphinxDecoder(const PocketsphinxDecoder &) = delete;
    PocketsphinxDecoder &operator=(const PocketsphinxDecoder &) = delete;

    bool begin(const QString &grammarFile, QString *error) override;
    bool process(const qint16 *samples, qsizetype count, QString *error) override;
    QString partialResult() override;
    std::optional<QString> end(QString *error) override;

private:
    ps_decoder_s *m_decoder;
    QByteArray m_dictationSearch; ///< the language model search set up at load
    QString m_grammarFile; ///< the grammar loaded into the "grammar" search
    bool m_inUtterance = false;
};

} // namespace Cadenza::Engines

#endif
