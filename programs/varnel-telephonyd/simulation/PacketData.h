#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/Random.h"

namespace varnel::simulation {

/// The packet-data contexts of the phone. They come and go, and data flows through the active ones.
class PacketData {
 public:
  explicit PacketData(Random random);

  /// Lets one second pass.
  void step();

  /// The current contexts. Each is a dictionary of texts.
  Value contexts() const;

 private:
  enum class State { Inactive, Activating, Active, Deactivating };

  // The purpose of a context, and how it is used.
  struct Purpose {
    const char* accessPoint;
    const char* type;
    const char* addressPrefix;  // followed by a number from 1 to 250
    int qualityClass;
    int longestIdle_s, longestUse_s;
    std::int64_t fastest_bytes;  // per second
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
