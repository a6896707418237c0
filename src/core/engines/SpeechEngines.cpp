// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechEngines.h"

#include "EnginePlugins_p.h"
#include "SpeechEngine.h"
#include "cadenza-config.h"
#include "cadenzacore_logging.h"

namespace Cadenza::Platform {

const QString SpeechEngines::DefaultEngine = QStringLiteral("espeak-ng");
const char SpeechEngines::PluginPathVariable[] = "CADENZA_PLUGIN_PATH";

namespace {

EnginePlugins &plugins()
{
    static EnginePlugins instance({CadenzaSpeechEngine_iid, QStringLiteral("cadenza/speech-engines"),
        QStringLiteral(CADENZA_PLUGINDIR), QStringLiteral("speech engine"), &lcSpeech,
        [](QObject *object) { return qobject_cast<SpeechEngine *>(object) != nullptr; }});
    return instance;
}

} // namespace

QStringList SpeechEngines::pluginFolders()
{
    return plugins().pluginFolders();
}

QStringList SpeechEngines::availableEngines()
{
    return plugins().availableEngines();
}

bool SpeechEngines::isAvailable(const QString &name, QString *reason)
{
    return plugins().isAvailable(name, reason);
}

SpeechEngine *SpeechEngines::engine(const QString &name, QString *error)
{
    return qobject_cast<SpeechEngine *>(plugins().engine(name, error));
}

} // namespace Cadenza::Platform
