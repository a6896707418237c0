#include "DistributedNotificationCenter.h"

namespace Cadenza::Platform {

DistributedNotificationCenter::DistributedNotificationCenter(QObject *parent)
    : QObject(parent)
{ }

DistributedNotificationCenter::~DistributedNotificationCenter() = default;

} // namespace Cadenza::Platform
