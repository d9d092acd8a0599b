#pragma once

#include <functional>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// What a part of a phone needs of the phone: where it is, and a way for packets out of it.
struct PhoneLink {
  std::function<Situation()> situation;
  std::function<void(Bytes packet)> send;
};

}  // namespace varnel::simulation
