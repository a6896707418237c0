#include "SoundService.h"

namespace Cadenza::Platform {

SoundService::SoundService(QObject *parent)
    : QObject(parent)
{ }

SoundService::~SoundService() = default;

} // namespace Cadenza::Platform
