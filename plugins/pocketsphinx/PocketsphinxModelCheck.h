// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLUGINS_POCKETSPHINXMODELCHECK_H
#define CADENZA_PLUGINS_POCKETSPHINXMODELCHECK_H

#include "core/engines/RecognitionEngine.h"

namespace Cadenza::Engines {

/// The files of a pocketsphinx model, checked by their first bytes only: listing stays fast.
struct PocketsphinxModelFiles
{
    QString acousticModel;
    QString languageModel;
    QString dictionary;

    /// Finds and checks the files of @p model; false with a readable @p reason.
    [[nodiscard]] bool resolve(const Platform::RecognizerModel &model, QString *reason);
};

} // namespace Cadenza::Engines

#endif
