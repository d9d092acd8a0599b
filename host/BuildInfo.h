#pragma once

#include "platform/ApplicationInfo.h"

namespace varnel {

/// What this build says about itself.
ApplicationInfo applicationInfo();

}  // namespace varnel
