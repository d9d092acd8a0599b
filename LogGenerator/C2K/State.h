#pragma once

#include <string>

#include "LogGenerator/BoundEntry.h"
#include "LogGenerator/LogGenerator.h"
#include "base/Dictionary.h"

namespace varnel::c2k {

/// The entries of the state with what a link had sent when it sent its last packet, and the entries of the
/// extra information with what it had sent then and before. Their names begin with the name of the link.
struct LinkEntries {
  explicit LinkEntries(const std::string& link)
      : sequence(link + "DataSeqNum"),
        sent(link + "DataSent"),
        newSequence(link + "DataSeqNum1"),
        newSent(link + "DataSent1"),
        oldSequence(link + "DataSeqNum2"),
        oldSent(link + "DataSent2") {}

  BoundEntry sequence, sent;
  BoundEntry newSequence, newSent;
  BoundEntry oldSequence, oldSent;
};

/// The positions of the entries that packets use.
struct StateEntries {
  BoundEntry display{stateKey::display};
  BoundEntry lookup{stateKey::lookup};
  BoundEntry extraInfo{stateKey::extraInfo};
  BoundEntry trafficFER{"TrafficFER"};
  LinkEntries forwardLink{"FL"};
  LinkEntries reverseLink{"RL"};
};

/// The state dictionary, in which decoders keep what they have to remember until the next packet.
struct State {
  Dictionary& entries;
  StateEntries& bound;
};

}  // namespace varnel::c2k
