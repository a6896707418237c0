// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SERVICES_H
#define CADENZA_PLATFORM_SERVICES_H

#include "cadenzacore_export.h"

#include <memory>

namespace Cadenza::Platform {

class AdministratorService;
class DistributedNotificationCenter;
class MessagePortService;
class PowerSourcesInfo;
class PreferencesStore;
class RecognitionService;
class SoundService;
class SpeechSynthesisService;
class UserLocaleService;

/**
 * The process's platform services. Each is the Linux implementation, made on first use, unless a
 * test installed another one with a set…() call before.
 */
class CADENZACORE_EXPORT Services
{
public:
    static PreferencesStore &preferences();
    static SpeechSynthesisService &speechSynthesis();
    static UserLocaleService &userLocale();
    static MessagePortService &messagePorts();
    static DistributedNotificationCenter &notifications();
    static RecognitionService &recognition();
    static PowerSourcesInfo &powerSources();
    static AdministratorService &administrator();
    /// Sound playback (voice samples); never blocks its caller.
    static SoundService &sound();

    /// Replaces a service; passing nullptr returns to the Linux implementation.
    static void setPreferences(std::shared_ptr<PreferencesStore> store);
    static void setSpeechSynthesis(std::shared_ptr<SpeechSynthesisService> service);
    static void setUserLocale(std::shared_ptr<UserLocaleService> service);
    static void setMessagePorts(std::shared_ptr<MessagePortService> service);
    static void setNotifications(std::shared_ptr<DistributedNotificationCenter> center);
    static void setRecognition(std::shared_ptr<RecognitionService> service);
    static void setPowerSources(std::shared_ptr<PowerSourcesInfo> info);
    static void setAdministrator(std::shared_ptr<AdministratorService> service);
    static void setSound(std::shared_ptr<SoundService> service);
};

} // namespace Cadenza::Platform

#endif
