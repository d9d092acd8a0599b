#pragma once

#include <vector>

#include "base/Bytes.h"
#include "programs/varnel-telephonyd/simulation/Random.h"
#include "programs/varnel-telephonyd/simulation/Situation.h"

namespace varnel::simulation {

/// One random access, with which a phone begins each connection.
class LTERandomAccess {
 public:
  /// The phone sends this message of six bytes as its first one. The network finds it again in its answer.
  LTERandomAccess(const Situation& situation, ByteView firstMessage, Random& random);

  /// The packets of the procedure, in their order: 0xB061, 0xB166, 0xB167, 0xB168, 0xB062, and 0xB16A.
  std::vector<Bytes> packets() const;

 private:
  Bytes configuration() const;
  Bytes attempt() const;
  Bytes preambleConfiguration() const;
  Bytes preamble() const;
  Bytes response() const;
  Bytes contentionResolution() const;

  Situation _situation;
  Bytes _firstMessage;
  std::int64_t _preamble, _temporaryIdentity, _pathLoss_db, _timingAdvance, _power_dbm;
};

}  // namespace varnel::simulation
