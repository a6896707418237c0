#include "Logging.h"

namespace Cadenza::Platform {

Q_LOGGING_CATEGORY(lcPreferences, "cadenza.preferences", QtInfoMsg)
Q_LOGGING_CATEGORY(lcVoices, "cadenza.voices", QtInfoMsg)
Q_LOGGING_CATEGORY(lcSpeech, "cadenza.speech", QtInfoMsg)
Q_LOGGING_CATEGORY(lcLocale, "cadenza.locale", QtInfoMsg)
Q_LOGGING_CATEGORY(lcLocalization, "cadenza.localization", QtInfoMsg)
Q_LOGGING_CATEGORY(lcNotifications, "cadenza.notifications", QtInfoMsg)
Q_LOGGING_CATEGORY(lcPorts, "cadenza.ports", QtInfoMsg)
Q_LOGGING_CATEGORY(lcInstallation, "cadenza.installation", QtInfoMsg)

} // namespace Cadenza::Platform
