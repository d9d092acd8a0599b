#pragma once

#include <optional>

#include "host/captures/Capture.h"

namespace varnel {

/// The binary log that viewers of this system save: a version report, then the messages of each display's
/// interval. An interval has lost its first byte. Its later messages have kept their log type and their
/// prefix. The class finds records by their lengths and by what follows them. All other bytes are counted.
class BinaryLogCapture final : public Capture {
 public:
  explicit BinaryLogCapture(CaptureInput input) : Capture(std::move(input)) {}
  bool next(CaptureRecord& record) override;

 private:
  enum class Position { BehindRecord, Searching };

  void passOverReport();
  void take(std::size_t recordOffset, std::size_t end, CaptureRecord& record);

  bool _hasReport = true;
  Position _position = Position::BehindRecord;
  std::optional<std::uint64_t> _lastTime;  // from the header of the last record
};

/// The length of the version report at the beginning of such a log.
inline constexpr std::size_t versionReportSize = 161;

/// Whether the bytes begin with a version report; false when there are too few bytes.
bool beginsWithVersionReport(ByteView bytes);

}  // namespace varnel
