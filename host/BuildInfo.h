#pragma once

#include "platform/ApplicationInfo.h"

namespace varnel {

/// What this build says of itself.
ApplicationInfo applicationInfo();

}  // namespace varnel
