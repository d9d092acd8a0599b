#pragma once

#include <optional>

#include "host/captures/Capture.h"

namespace varnel {

/// The binary log that viewers of this system save: a version report, then the messages of each display's
/// interval. An interval has lost its first byte; its later messages have kept their log type and what stands
/// before it. Records are found by their lengths and by what follows them; whatever else the log holds is
/// counted.
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
  std::optional<std::uint64_t> _lastTime;  // as the last record's header has it
};

/// The length of the version report, with which such a log begins.
inline constexpr std::size_t versionReportSize = 161;

/// Whether that is what the bytes begin with; not when there are too few to say so.
bool beginsWithVersionReport(ByteView bytes);

}  // namespace varnel
