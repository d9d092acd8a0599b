#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The packet-data contexts of the phone: they come and go, and data flows through those that are active.
class PacketData {
 public:
  explicit PacketData(Random random);

  /// One second passes.
  void step();

  /// The contexts that exist now, each a dictionary of texts.
  Value contexts() const;

 private:
  enum class State { Inactive, Activating, Active, Deactivating };

  // What a context is for and how it is used.
  struct Purpose {
    const char* accessPoint;
    const char* type;
    const char* addressPrefix;  // before a number from 1 to 250
    int qualityClass;
    int longestIdle_s, longestUse_s;
    std::int64_t fastest_bytes;  // a second
  };
  struct Context {
    const Purpose* purpose;
    State state;
    std::int64_t left_s;  // until the next state
    std::int64_t addressNumber;
    std::int64_t sent_bytes, received_bytes;
  };

  static const Purpose purposes[];

  static const char* name(State state);
  void enterNextState(Context& context);
  void transfer(Context& context);
  static Value rows(const Context& context, int contextID);

  Random _random;
  std::vector<Context> _contexts;
};

}  // namespace varnel::simulation
