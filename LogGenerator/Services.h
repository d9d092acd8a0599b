#pragma once

#include <iosfwd>

#include "LogGenerator/Identities.h"
#include "platform/ApplicationInfo.h"
#include "platform/Clock.h"
#include "platform/Resources.h"

namespace varnel {

/// What a generator needs from its host. Every object in it must outlive the generator.
struct Services {
  const Resources& resources;
  const Clock& clock;
  const ApplicationInfo& application;
  std::ostream& standardOutput;                ///< for the few lines that generators write there
  Identities identities = Identities::Hidden;  ///< heeded by the technology of all radios alone
};

}  // namespace varnel
