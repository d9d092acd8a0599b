#pragma once

#include <map>
#include <optional>
#include <vector>

#include "base/Time.h"

namespace varnel {

/// How the messages before a place of a capture are fetched: in stages, since all messages of a stage come at
/// once, and tell no times. The nearer the place, the shorter a stage, so that the age of everything that is
/// shown is about right, and whatever counts after 30 s or a minute is on the right side.
///
/// The clock shows the time of a stage's end while its messages come. It is guessed from what was told last.
/// The guess is wrong where the capture has a long pause, or where its clock was set: then the jump is worth
/// repeating with the times that are known now.
///
/// Places are in milliseconds of playing at speed 1.
class JumpStages {
 public:
  explicit JumpStages(int place) : _place(place) {}

  int place() const { return _place; }
  /// Everything up to this place is there already.
  void begin(int from);
  bool isDone() const { return _stages.empty(); }
  /// The end of the next stage. There must be one.
  int next() const { return _stages.back(); }
  /// The time of that end, when this place has this time. The end is reached next.
  Time expect(int from, Time time);
  /// The end of the stage is reached, and the last message has this time, if it is known.
  void reach(std::optional<Time> told);
  /// The same jump again, from the start. Only one whose times were guessed wrong is worth it, and only once.
  std::optional<JumpStages> repetition() const;

 private:
  int _place;
  std::vector<int> _stages;    // ends; the next one last
  std::map<int, Time> _times;  // of ends, as they were told
  std::optional<Time> _expected;
  bool _isMistaken = false;
  bool _isRepeated = false;
};

}  // namespace varnel
