#pragma once

#include <chrono>
#include <optional>
#include <string>

namespace varnel {

/// What became of a capture of a list.
enum class CaptureFate {
  Decoded,
  Failed,   ///< it could not be read, or not to its end, or its output could not be written
  Aborted,  ///< the decoder ended by a signal
  Present,  ///< its output was there, and newer than the capture
};

/// "decoded".
std::string_view nameOf(CaptureFate fate);

/// One capture of a report.
struct CaptureEntry {
  std::string path{};
  CaptureFate fate = CaptureFate::Decoded;
  std::string why{};      ///< one sentence; empty unless the capture failed or its decoder aborted
  std::string details{};  ///< `MessageStatistics::asReportMembers`; empty when it is not known
  std::chrono::duration<double> time{0};
};

/// The capture as one line of JSON: {"Path": …, "Status": …, "Why": …, "Records": …, "Left Out": {…},
/// "Unknown Versions": […], "Seconds": …}. What is not known is null. A path that is no UTF-8 is followed by
/// "Path Bytes": all its bytes in hexadecimal digits.
std::string reportLine(const CaptureEntry& entry);

}  // namespace varnel
