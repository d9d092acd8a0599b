#pragma once

#include <iosfwd>

#include "platform/ApplicationInfo.h"
#include "platform/Clock.h"
#include "platform/Resources.h"

namespace varnel {

/// What a generator may ask of its host. Everything outlives the generator.
struct Services {
  const Resources& resources;
  const Clock& clock;
  const ApplicationInfo& application;
  std::ostream& standardOutput;  ///< for the few lines that belong there
};

}  // namespace varnel
