#include "programs/varnel-telephonyd/simulation/radios/AllRadiosModem.h"

#include <utility>

#include "platform/TelephonyService.h"

namespace varnel::simulation {

AllRadiosModem::AllRadiosModem(Random random)
    : _walk(random.fork()),
      _first(_walk, random.fork()),
      _second(_walk, random.fork()),
      _nextOfFirst(_first.next()),
      _nextOfSecond(_second.next()) {}

std::string_view AllRadiosModem::technology() const { return varnel::technology::allRadios; }

SimulatedMessage AllRadiosModem::next() {
  if (_nextOfFirst.at <= _nextOfSecond.at) return std::exchange(_nextOfFirst, _first.next());
  return std::exchange(_nextOfSecond, _second.next());
}

}  // namespace varnel::simulation
