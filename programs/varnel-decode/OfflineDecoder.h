#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "LogGenerator/LogGenerator.h"
#include "base/Bytes.h"
#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"
#include "programs/varnel-decode/CaptureClock.h"
#include "programs/varnel-decode/Generation.h"

namespace varnel {

/// What a decoder keeps for snapshots and binary logs.
enum class RawBytes { Kept, NotKept };

/// How often the clock of a capture was set, and how the first time.
struct ClockSteps {
  std::size_t count = 0;
  Time from, to;
};

/// Runs a generator on a capture as the viewer would have run it live: each record is one message, and the
/// display timer ticks every 2.0 s from the first record on, by the capture's own time.
///
/// A record that is dated up to 10 s before an earlier one counts as of that one's time. Beyond that, and
/// when a record comes more than a day later, the clock was set: one tick fires, so that no message goes
/// without its display, and the timer starts anew at the record. Nothing takes longer for that.
class OfflineDecoder {
 public:
  /// The generator must look at this clock. Both outlive the decoder. Without raw bytes the records of the
  /// history hold none, and there is nothing to save.
  OfflineDecoder(LogGenerator& generator, CaptureClock& clock, RawBytes rawBytes);

  /// Fires every tick at or before the time. Returned is what the first of them generates: it finds the
  /// messages since the tick before, the others find nothing new.
  std::optional<Generation> fireTicks(Time now);

  /// Fires every tick at or before the time that has not been fired, then hands the message to the generator
  /// at the time that it counts as of. An exception that a decoder raises ends the program here.
  void deliver(Time time, ByteView message) noexcept;

  /// Generates the last display, at the time of the last record: the absent value when there is none.
  Value finish();

  /// True once a message has been delivered.
  bool hasStarted() const { return _start.has_value(); }

  const ClockSteps& clockSteps() const { return _clockSteps; }

  /// What a snapshot of this moment holds.
  Value saveContents() const { return _generator.getSaveContentsFromState(_state); }

 private:
  Generation fireNextTick();
  void startAnew(Time now);

  LogGenerator& _generator;
  CaptureClock& _clock;
  Dictionary _state;
  std::optional<Time> _start;     // of the ticks; absent before the first record
  Time _now;                      // what the last record counted as of
  std::uint64_t _ticksFired = 0;  // since the start
  ClockSteps _clockSteps;
};

}  // namespace varnel
