#pragma once

#include <memory>
#include <ostream>

#include "LogGenerator/LogGenerator.h"
#include "PacketCases.h"
#include "host/FileResources.h"
#include "host/SystemClock.h"

namespace varnel {

/// A generator with its real template that decodes the message of a case again and again.
class DecodingLoop {
 public:
  explicit DecodingLoop(const PacketCase& packetCase)
      : _message(packetCase.message()),
        _advance(packetCase.advance),
        _generator(LogGenerator::generatorFromTechnology(
            packetCase.technology, {_resources, _clock, _application, _standardOutput})) {}

  const Bytes& message() const { return _message; }
  void decode() {
    if (_advance) _advance(_message);
    _generator->updateState_withData(_state, _message);
  }
  /// Removes the raw bytes that the generator keeps until the next display.
  void display() { _generator->generateLogUsingState(_state); }

 private:
  const FileResources _resources{resourceFolder()};
  const SystemClock _clock;
  const ApplicationInfo _application;
  std::ostream _standardOutput{nullptr};
  Bytes _message;
  void (*_advance)(Bytes& message);
  Dictionary _state;
  std::unique_ptr<LogGenerator> _generator;
};

}  // namespace varnel
