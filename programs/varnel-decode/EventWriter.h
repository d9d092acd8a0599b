#pragma once

#include <chrono>
#include <cstdio>
#include <optional>
#include <string>

#include "host/captures/CaptureRecord.h"
#include "model/events/DisplayEvent.h"

namespace varnel {

/// The form of events.
enum class EventFormat {
  Text,  ///< for people
  Json,  ///< an object per line
  Csv,   ///< RFC 4180, without the header
};

/// Whether the table has a first column with the capture's name.
enum class EventColumns { WithoutCapture, WithCapture };

/// The header line of the table.
std::string eventTableHeader(EventColumns columns);

/// Writes events, one line each, as soon as it gets them. Control characters are written like `\u001B`.
class EventWriter {
 public:
  /// Text does not name the capture.
  EventWriter(std::FILE* output, std::optional<std::string> captureName, EventFormat format)
      : _output(output), _captureName(std::move(captureName)), _format(format) {}

  /// Where the date is not known, `elapsed` stands in its place, the time since the first record. Throws
  /// std::system_error when the output cannot be written.
  void write(const DisplayEvent& event, Dating dating, std::chrono::nanoseconds elapsed) const;

 private:
  std::FILE* _output;
  std::optional<std::string> _captureName;
  EventFormat _format;
};

}  // namespace varnel
