// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLUGINS_POCKETSPHINXENGINEPLUGIN_H
#define CADENZA_PLUGINS_POCKETSPHINXENGINEPLUGIN_H

#include "core/engines/RecognitionEngine.h"

#include <QObject>

namespace Cadenza::Engines {

/**
 * The pocketsphinx engine. A bundle's "RecognitionModel" names, relative to the bundle folder, the
 * "AcousticModel" folder, the "LanguageModel" file and the pronouncing "Dictionary".
 */
class PocketsphinxEnginePlugin final : public QObject, public Platform::RecognitionEngine
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID CadenzaRecognitionEngine_iid FILE "pocketsphinx.json")
    Q_INTERFACES(Cadenza::Platform::RecognitionEngine)
public:
    QString engineName() const override { return QStringLiteral("pocketsphinx"); }
    int sampleRate() const override { return 16000; }
    bool checkModel(const Platform::RecognizerModel &model, QString *reason) const override;
    std::unique_ptr<Platform::RecognitionDecoder> load(
        const Platform::RecognizerModel &model, QString *error) override;
};

} // namespace Cadenza::Engines

#endif
