// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Services.h"

#include "AdministratorService.h"
#include "BundleSpeechSynthesisService.h"
#include "DBusNotificationCenter.h"
#include "EnvironmentUserLocaleService.h"
#include "FilePreferencesStore.h"
#include "MediaSoundService.h"
#include "PowerSourcesInfo.h"
#include "RecognitionService.h"
#include "UnixMessagePortService.h"

#include <QMutex>

namespace Cadenza::Platform {

namespace {

struct Registry
{
    QMutex mutex;
    std::shared_ptr<PreferencesStore> preferences;
    std::shared_ptr<SpeechSynthesisService> speechSynthesis;
    std::shared_ptr<UserLocaleService> userLocale;
    std::shared_ptr<MessagePortService> messagePorts;
    std::shared_ptr<DistributedNotificationCenter> notifications;
    std::shared_ptr<RecognitionService> recognition;
    std::shared_ptr<PowerSourcesInfo> powerSources;
    std::shared_ptr<AdministratorService> administrator;
    std::shared_ptr<SoundService> sound;
};

Registry &registry()
{
    static Registry instance; // lives until exit, like every process-wide service
    return instance;
}

template<typename Service, typename Linux>
Service &serviceOf(std::shared_ptr<Service> Registry::*member)
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    auto &slot = r.*member;
    if (!slot) {
        slot = std::make_shared<Linux>();
    }
    return *slot;
}

template<typename Service>
void replace(std::shared_ptr<Service> Registry::*member, std::shared_ptr<Service> service)
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    r.*member = std::move(service);
}

} // namespace

PreferencesStore &Services::preferences()
{
    return serviceOf<PreferencesStore, FilePreferencesStore>(&Registry::preferences);
}

SpeechSynthesisService &Services::speechSynthesis()
{
    return serviceOf<SpeechSynthesisService, BundleSpeechSynthesisService>(&Registry::speechSynthesis);
}

UserLocaleService &Services::userLocale()
{
    return serviceOf<UserLocaleService, EnvironmentUserLocaleService>(&Registry::userLocale);
}

MessagePortService &Services::messagePorts()
{
    return serviceOf<MessagePortService, UnixMessagePortService>(&Registry::messagePorts);
}

DistributedNotificationCenter &Services::notifications()
{
    return serviceOf<DistributedNotificationCenter, DBusNotificationCenter>(&Registry::notifications);
}

void Services::setPreferences(std::shared_ptr<PreferencesStore> store)
{
    replace(&Registry::preferences, std::move(store));
}

void Services::setSpeechSynthesis(std::shared_ptr<SpeechSynthesisService> service)
{
    replace(&Registry::speechSynthesis, std::move(service));
}

void Services::setUserLocale(std::shared_ptr<UserLocaleService> service)
{
    replace(&Registry::userLocale, std::move(service));
}

} // namespace Cadenza::Platform

namespace Cadenza::Platform {

void Services::setMessagePorts(std::shared_ptr<MessagePortService> service)
{
    replace(&Registry::messagePorts, std::move(service));
}

void Services::setNotifications(std::shared_ptr<DistributedNotificationCenter> center)
{
    replace(&Registry::notifications, std::move(center));
}

} // namespace Cadenza::Platform

namespace Cadenza::Platform {

RecognitionService &Services::recognition()
{
    return serviceOf<RecognitionService, BundleRecognitionService>(&Registry::recognition);
}

void Services::setRecognition(std::shared_ptr<RecognitionService> service)
{
    replace(&Registry::recognition, std::move(service));
}

} // namespace Cadenza::Platform

namespace Cadenza::Platform {

PowerSourcesInfo &Services::powerSources()
{
    return serviceOf<PowerSourcesInfo, SysfsPowerSourcesInfo>(&Registry::powerSources);
}

void Services::setPowerSources(std::shared_ptr<PowerSourcesInfo> info)
{
    replace(&Registry::powerSources, std::move(info));
}

} // namespace Cadenza::Platform

namespace Cadenza::Platform {

AdministratorService &Services::administrator()
{
    return serviceOf<AdministratorService, PolkitAdministratorService>(&Registry::administrator);
}

void Services::setAdministrator(std::shared_ptr<AdministratorService> service)
{
    replace(&Registry::administrator, std::move(service));
}

} // namespace Cadenza::Platform

namespace Cadenza::Platform {

SoundService &Services::sound()
{
    return serviceOf<SoundService, MediaSoundService>(&Registry::sound);
}

void Services::setSound(std::shared_ptr<SoundService> service)
{
    replace(&Registry::sound, std::move(service));
}

} // namespace Cadenza::Platform
