#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/CDMACarrier.h"

namespace varnel::simulation {

/// The active set of a CDMA phone: its pilots. With its own channel, the phone adds every pilot that becomes
/// strong enough, and drops a pilot that was weak for a while. Otherwise the set holds only the serving
/// cell's pilot.
class PilotSet {
 public:
  /// Strengths of pilots, in parts of `ReceivedPilot::whole`.
  struct Thresholds {
    std::int64_t add, drop;
  };
  static constexpr std::size_t mostPilots = 6;

  explicit PilotSet(Thresholds thresholds) : _thresholds(thresholds) {}

  /// Compares the strengths. Call it once per step of the walk. The serving cell's pilot is always in the
  /// set.
  void update(const CDMACarrier& carrier, const Cell& serving);
  /// Sets the active set to this cell only, or to no cell.
  void reset(const Cell* only);

  /// The members in the order in which they were added, with the strengths on this carrier.
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
