#include "UserLocaleService.h"

namespace Cadenza::Platform {

UserLocaleService::~UserLocaleService() = default;

} // namespace Cadenza::Platform
