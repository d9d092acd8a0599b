#pragma once

#include "LogGenerator/LogGenerator.h"
#include "platform/Dictionary.h"

namespace varnel::c2k {

/// The entries of the state that hold what one link had sent when it wrote its last packet, and those of the
/// extra information that hold what it had sent then and before.
struct LinkSlots {
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
  LinkSlots forwardLink{
      .sequence = Dictionary::Slot("FLDataSeqNum"),
      .sent = Dictionary::Slot("FLDataSent"),
      .newSequence = Dictionary::Slot("FLDataSeqNum1"),
      .newSent = Dictionary::Slot("FLDataSent1"),
      .oldSequence = Dictionary::Slot("FLDataSeqNum2"),
      .oldSent = Dictionary::Slot("FLDataSent2"),
  };
  LinkSlots reverseLink{
      .sequence = Dictionary::Slot("RLDataSeqNum"),
      .sent = Dictionary::Slot("RLDataSent"),
      .newSequence = Dictionary::Slot("RLDataSeqNum1"),
      .newSent = Dictionary::Slot("RLDataSent1"),
      .oldSequence = Dictionary::Slot("RLDataSeqNum2"),
      .oldSent = Dictionary::Slot("RLDataSent2"),
  };
};

/// The state dictionary, in which decoders keep what they must remember until the next packet.
struct State {
  Dictionary& entries;
  StateSlots& slots;
};

}  // namespace varnel::c2k
