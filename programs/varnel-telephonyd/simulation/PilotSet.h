#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"

namespace varnel::simulation {

/// The pilots of a CDMA phone's active set. On a channel of its own the phone takes in every pilot that gets
/// strong enough and drops one that has been weak for a while; else it has the serving cell's alone.
class PilotSet {
 public:
  /// Strengths of pilots, of `ReceivedPilot::whole`.
  struct Thresholds {
    std::int64_t add, drop;
  };
  static constexpr std::size_t mostPilots = 6;

  explicit PilotSet(Thresholds thresholds) : _thresholds(thresholds) {}

  /// Looks at the strengths, once a step of the walk. The serving cell's pilot is in the set always.
  void update(const CDMACarrier& carrier, const Cell& serving);
  /// From now on the set has that cell alone, or none.
  void reset(const Cell* only);

  /// The members in the order in which they came, as the carrier tells them.
  std::vector<ReceivedPilot> pilots(const CDMACarrier& carrier) const;

 private:
  struct Member {
    const Cell* cell;
    int weakSteps = 0;
  };

  bool has(const Cell& cell) const;
  void add(const Cell& cell);

  Thresholds _thresholds;
  std::vector<Member> _members;
};

}  // namespace varnel::simulation
