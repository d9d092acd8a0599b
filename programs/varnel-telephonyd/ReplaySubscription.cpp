#include "programs/varnel-telephonyd/ReplaySubscription.h"

#include <utility>

#include "base/Log.h"

namespace varnel {

bool ReplaySubscription::takes(std::optional<std::uint8_t> subscription) {
  if (_filter.takes(subscription)) return true;
  _hasOthers = true;
  if (std::exchange(_tellsOthers, false)) {
    logError("%s has records of %s, which are replayed, and of %s, which are not; choose by --sim", _name,
             subscriptionName(_filter.taken()), subscriptionName(subscription));
  }
  return false;
}

std::string ReplaySubscription::endNote(bool hasPlayed) const {
  std::string note = "the replay of " + _name + " has ended";
  if (!hasPlayed && _hasOthers) note += ": it has no records of " + subscriptionName(_filter.taken());
  return note;
}

}  // namespace varnel
