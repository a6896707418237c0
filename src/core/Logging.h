#ifndef CADENZA_PLATFORM_LOGGING_H
#define CADENZA_PLATFORM_LOGGING_H

#include "cadenzacore_export.h"

#include <QLoggingCategory>

namespace Cadenza::Platform {

// The platform log: every line Cadenza writes goes through one of these categories.
CADENZACORE_EXPORT Q_DECLARE_LOGGING_CATEGORY(lcPreferences) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcVoices) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcSpeech) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcLocale) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcLocalization) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcNotifications) CADENZACORE_EXPORT
    Q_DECLARE_LOGGING_CATEGORY(lcPorts) CADENZACORE_EXPORT Q_DECLARE_LOGGING_CATEGORY(lcInstallation)

} // namespace Cadenza::Platform

#endif
