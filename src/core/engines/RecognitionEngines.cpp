// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognitionEngines.h"

#include "EnginePlugins_p.h"
#include "RecognitionEngine.h"
#include "cadenza-config.h"
#include "cadenzacore_logging.h"

namespace Cadenza::Platform {

namespace {

EnginePlugins &plugins()
{
    static EnginePlugins instance({CadenzaRecognitionEngine_iid,
        QStringLiteral("cadenza/recognition-engines"), QStringLiteral(CADENZA_RECOGNITION_PLUGINDIR),
        QStringLiteral("recognition engine"), &lcInstallation,
        [](QObject *object) { return qobject_cast<RecognitionEngine *>(object) != nullptr; }});
    return instance;
}

} // namespace

QStringList RecognitionEngines::pluginFolders()
{
    return plugins().pluginFolders();
}

QStringList RecognitionEngines::availableEngines()
{
    return plugins().availableEngines();
}

RecognitionEngine *RecognitionEngines::engine(const QString &name, QString *error)
{
    return qobject_cast<RecognitionEngine *>(plugins().engine(name, error));
}

} // namespace Cadenza::Platform
