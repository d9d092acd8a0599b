#pragma once

#include <string>

#include "LogGenerator/LogGenerator.h"
#include "base/Dictionary.h"

namespace varnel::c2k {

/// The entries of the state that hold what one link had sent when it wrote its last packet, and those of the
/// extra information that hold what it had sent then and before. Their names begin with that of the link.
struct LinkSlots {
  explicit LinkSlots(const std::string& link)
      : sequence(link + "DataSeqNum"),
        sent(link + "DataSent"),
        newSequence(link + "DataSeqNum1"),
        newSent(link + "DataSent1"),
        oldSequence(link + "DataSeqNum2"),
        oldSent(link + "DataSent2") {}

  Dictionary::Slot sequence, sent;
  Dictionary::Slot newSequence, newSent;
  Dictionary::Slot oldSequence, oldSent;
};

/// Where the entries stand that packets need.
struct StateSlots {
  Dictionary::Slot display{stateKey::display};
  Dictionary::Slot lookup{stateKey::lookup};
  Dictionary::Slot extraInfo{stateKey::extraInfo};
  Dictionary::Slot trafficFER{"TrafficFER"};
  LinkSlots forwardLink{"FL"};
  LinkSlots reverseLink{"RL"};
};

/// The state dictionary, in which decoders keep what they must remember until the next packet.
struct State {
  Dictionary& entries;
  StateSlots& slots;
};

}  // namespace varnel::c2k
