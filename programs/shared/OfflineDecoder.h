#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "LogGenerator/LogGenerator.h"
#include "base/Bytes.h"
#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"
#include "programs/shared/CaptureClock.h"
#include "programs/shared/Generation.h"

namespace varnel {

/// What a decoder keeps for snapshots and binary logs.
enum class RawBytes { Kept, NotKept };

/// How often the clock of a capture was set, and how it was set the first time.
struct ClockSteps {
  std::size_t count = 0;
  Time from, to;
};

/// Runs a generator on a capture as the viewer would have run it live. Each record is one message. The
/// display timer ticks every 2.0 s from the first record on, by the capture's own time.
///
/// A record dated up to 10 s before an earlier one counts as if it had the earlier one's time. If it is dated
/// still earlier, or more than a day later, the clock was set. Then one tick fires, so that every message is
/// in a display, and the timer starts again at this record. A jump of any length takes no extra time.
class OfflineDecoder {
 public:
  /// The generator must use this clock. Both must outlive the decoder. Without raw bytes the snapshot records
  /// hold none, and there is nothing to save.
  OfflineDecoder(LogGenerator& generator, CaptureClock& clock, RawBytes rawBytes);

  /// Fires every tick at or before the time. Returns what the first of them generates: only that tick finds
  /// new messages.
  std::optional<Generation> fireTicks(Time now);

  /// Fires every tick at or before the time that has not fired yet. Then gives the message to the generator,
  /// at the time that the record counts as. An exception from a decoder ends the program here.
  void deliver(Time time, ByteView message) noexcept;

  /// Generates the last display at the time of the last record; the absent value when there is no display.
  Value finish();

  /// What the messages so far have made of the display; absent while there is none. Unlike a generation, it
  /// lacks what decoders prepare only when a display is due.
  const Value& display() const { return _state.get(stateKey::display); }
  /// The time that the last record counts as.
  Time now() const { return _now; }

  /// True once a message has been delivered.
  bool hasStarted() const { return _start.has_value(); }

  const ClockSteps& clockSteps() const { return _clockSteps; }

  /// The contents of a snapshot of this moment.
  Value saveContents() const { return _generator.getSaveContentsFromState(_state); }

 private:
  Generation fireNextTick();
  void startAnew(Time now);

  LogGenerator& _generator;
  CaptureClock& _clock;
  Dictionary _state;
  std::optional<Time> _start;     // of the ticks; absent before the first record
  Time _now;                      // the time that the last record counts as
  std::uint64_t _ticksFired = 0;  // since the start
  ClockSteps _clockSteps;
};

}  // namespace varnel
