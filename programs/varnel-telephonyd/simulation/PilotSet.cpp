#include "programs/varnel-telephonyd/simulation/PilotSet.h"

#include <algorithm>

namespace varnel::simulation {

namespace {
constexpr int longestWeak_steps = 30;
}  // namespace

void PilotSet::update(const CDMACarrier& carrier, const Cell& serving) {
  for (Member& member : _members) {
    const bool isWeak = carrier.strength(*member.cell) < _thresholds.drop;
    member.weakSteps = isWeak ? member.weakSteps + 1 : 0;
  }
  std::erase_if(_members, [&serving](const Member& member) {
    return member.cell != &serving && member.weakSteps > longestWeak_steps;
  });
  if (!has(serving)) add(serving);
  for (const ReceivedPilot& pilot : carrier.pilots) {
    if (pilot.strength >= _thresholds.add && !has(*pilot.cell) && _members.size() < mostPilots)
      add(*pilot.cell);
  }
}

void PilotSet::reset(const Cell* only) {
  _members.clear();
  if (only) add(*only);
}

std::vector<ReceivedPilot> PilotSet::pilots(const CDMACarrier& carrier) const {
  std::vector<ReceivedPilot> pilots;
  for (const Member& member : _members) pilots.push_back({member.cell, carrier.strength(*member.cell)});
  return pilots;
}

bool PilotSet::has(const Cell& cell) const { return std::ranges::count(_members, &cell, &Member::cell) != 0; }

// A full set drops its oldest pilot. This happens only for the pilot of the serving cell.
void PilotSet::add(const Cell& cell) {
  if (_members.size() == mostPilots) _members.erase(_members.begin());
  _members.push_back({&cell});
}

}  // namespace varnel::simulation
