#include "programs/varnel/SavedHistory.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include "host/Printable.h"
#include "programs/varnel/CaptureHistory.h"

namespace varnel {

SavedHistory::SavedHistory(Wish wish)
    : _wish(std::move(wish)),
      _numbers(_wish.formats, CaptureHistory::limits),
      _trends({.numbers = _numbers,
               .events = _events,
               .name = [this] { return std::filesystem::path(_wish.path).filename().string(); },
               .clock = _wish.clock,
               .playedTime = _wish.shownTime,
               .input = [this] { return _wish.path; },
               .isComplete = true}) {}

std::string SavedHistory::obstacle() const {
  const std::string name = printable(std::filesystem::path(_wish.path).filename().string());
  if (_wish.displays.size() < 2)
    return name + " has one display only, so its numbers have no course. A capture of the same time has one.";
  const Time first = _wish.displays.front().time;
  const bool isOneMoment =
      std::ranges::all_of(_wish.displays, [&](const Generation& saved) { return saved.time == first; });
  return isOneMoment ? "All displays in " + name + " have the same time, so its numbers have no course."
                     : std::string();
}

HistoryTrends& SavedHistory::trends() {
  if (!std::exchange(_isRead, true)) read();
  return _trends;
}

void SavedHistory::read() {
  for (const Generation& saved : _wish.displays) {
    PathDictionary paths;
    _numbers.add(VarnelModelNode::makeTreeFromObject_withPathDictionary(saved.display, paths), saved.time);
  }
}

}  // namespace varnel
