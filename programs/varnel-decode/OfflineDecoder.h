#pragma once

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

/// Runs a generator on a capture as the viewer would have run it live: each record is one message, and the
/// display timer ticks every 2.0 s from the first record on, by the capture's own time.
class OfflineDecoder {
 public:
  /// The generator must look at this clock. Both outlive the decoder.
  OfflineDecoder(LogGenerator& generator, CaptureClock& clock) : _generator(generator), _clock(clock) {}

  /// Fires every tick at or before the time. Returned is what the first of them generates: it finds the
  /// messages since the tick before, the others find nothing new.
  std::optional<Generation> fireTicks(Time now);

  /// Fires every tick at or before the time that has not been fired, then hands the message to the generator
  /// at that time. Times need not be in order. An exception that a decoder raises ends the program here.
  void deliver(Time time, ByteView message) noexcept;

  /// Generates the last display, at the time of the last record: the absent value when there is none.
  Value finish();

  /// True once a message has been delivered.
  bool hasStarted() const { return _start.has_value(); }

  /// What a snapshot of this moment holds.
  Value saveContents() const { return _generator.getSaveContentsFromState(_state); }

 private:
  LogGenerator& _generator;
  CaptureClock& _clock;
  Dictionary _state;
  std::optional<Time> _start;
  std::uint64_t _ticksFired = 0;
};

}  // namespace varnel
