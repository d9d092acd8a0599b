#include "programs/varnel-telephonyd/Recorder.h"

#include <cstdint>
#include <stdexcept>
#include <utility>

namespace varnel {

namespace {

Time later(Time start, std::chrono::nanoseconds passed) {
  constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;
  const std::int64_t nanoseconds = start.nanoseconds + passed.count();
  return {start.seconds + nanoseconds / nanosecondsPerSecond,
          static_cast<std::int32_t>(nanoseconds % nanosecondsPerSecond)};
}

}  // namespace

Recorder::Recorder(Setup setup) : _setup(std::move(setup)) {
  _writer.emplace(_setup.path, _setup.existing, _setup.technology);
}

void Recorder::record(ByteView message) {
  if (!_writer) return;
  try {
    _writer->write(timeOfMessage(), message);
  } catch (const std::runtime_error& error) {
    _writer.reset();
    _setup.ended("the recording has ended: " + std::string(error.what()));
  }
}

Time Recorder::timeOfMessage() {
  if (!_start) {
    _start = _setup.now();
    _startUptime = _setup.uptime();
  }
  return later(*_start, _setup.uptime() - _startUptime);
}

}  // namespace varnel
