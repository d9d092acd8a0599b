#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "base/Time.h"

namespace varnel {

/// What reading one record of a capture has brought: the record, or the end.
struct RecordReading {
  Time time{};
  Bytes message{};  ///< as in CaptureRecord; empty at the end
  std::optional<std::uint8_t> subscription{};
  bool wasAwaited = false;           ///< the writer had to be waited for
  bool isEnd = false;                ///< nothing comes after this
  std::string error{};               ///< why it is the end; empty for the true end
  std::vector<std::string> lines{};  ///< about records that are left out, for the log
};

/// Reads a capture one record at a time, without making its caller wait.
class RecordReader {
 public:
  virtual ~RecordReader() = default;
  /// Begins to read the next record. Nothing else may be in the making, and the end may not have come.
  virtual void request() = 0;
  /// What has been read since the last call; nothing while it is in the making.
  virtual std::optional<RecordReading> take() = 0;
};

}  // namespace varnel
