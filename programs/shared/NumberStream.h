#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "app/ValueHistory.h"
#include "model/events/DisplayEvent.h"

namespace varnel {

// What a process that decodes a capture tells another one of its numbers: a stream of pieces. It is no format
// of files, since both ends are of the same version: a piece is a byte for its kind, 4 bytes for its length,
// and a body, with numbers as the machine has them.

/// Writes the stream.
class NumberStreamWriter {
 public:
  using Write = std::function<void(std::string_view bytes)>;

  explicit NumberStreamWriter(Write write) : _write(std::move(write)) {}

  /// First of all: whether the times mean anything to users.
  void begin(bool isDated);
  void generation(Time time, std::span<const ValueHistory::Reading> readings);
  void event(const DisplayEvent& event);
  /// How much of the capture is read, 0 to 1.
  void progress(double share);
  /// Last of all. Tells why the capture was not read to its end; nothing when it was.
  void end(std::string_view why);

 private:
  std::uint32_t numberOf(const ValueHistory::Reading& reading);

  Write _write;
  std::unordered_map<std::string, std::uint32_t> _rows;  // by key and unit
  std::string _body;
};

/// Takes the stream apart. Bytes that are no such stream are refused, whatever they are.
class NumberStreamReader {
 public:
  /// What the stream tells, in its order.
  struct Listener {
    std::function<void(bool isDated)> begin;
    std::function<void(Time time, std::span<const ValueHistory::Reading> readings)> generation;
    std::function<void(DisplayEvent event)> event;
    std::function<void(double share)> progress;
    std::function<void(const std::string& why)> end;
  };
  /// More rows than these have no number at the same time.
  static constexpr std::uint32_t mostRows = 65'536;
  static constexpr std::uint32_t longestPiece = 4 << 20;

  explicit NumberStreamReader(Listener listener) : _listener(std::move(listener)) {}

  /// Takes the next bytes. False when they are no stream of numbers: then no more are taken.
  bool take(std::string_view bytes);

 private:
  struct Row {
    std::string key, unit;
    std::uint32_t nameStart, nameLength;
  };

  bool takePiece(char kind, std::string_view body);
  bool takeRow(std::string_view body);
  bool takeGeneration(std::string_view body);
  bool takeEvent(std::string_view body);

  Listener _listener;
  std::vector<Row> _rows;
  std::vector<ValueHistory::Reading> _readings;
  std::string _pending;
  bool _isBroken = false;
};

}  // namespace varnel
