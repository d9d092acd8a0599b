#include "programs/varnel-decode/CaptureReport.h"

#include "base/PropertyListText.h"
#include "programs/shared/Timestamps.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

constexpr std::string_view unknownDetails = R"("Records":null,"Left Out":null,"Unknown Versions":null)";

// JSON can only hold UTF-8, so names that differ elsewhere would look alike.
std::string pathMembers(const std::string& path) {
  std::string members = "\"Path\":" + jsonString(path);
  if (canHold(Encoding::Binary, path)) return members;
  members += ",\"Path Bytes\":\"";
  constexpr std::string_view digits = "0123456789ABCDEF";
  for (const char character : path) {
    const auto byte = static_cast<unsigned char>(character);
    (members += digits[byte >> 4]) += digits[byte & 0xF];
  }
  return members + '"';
}

}  // namespace

std::string_view nameOf(CaptureFate fate) {
  switch (fate) {
    case CaptureFate::Decoded:
      return "decoded";
    case CaptureFate::Failed:
      return "failed";
    case CaptureFate::Aborted:
      return "aborted";
    case CaptureFate::Present:
      break;
  }
  return "present";
}

std::string reportLine(const CaptureEntry& entry) {
  const auto time = std::chrono::duration_cast<std::chrono::nanoseconds>(entry.time);
  return '{' + pathMembers(entry.path) + ",\"Status\":" + jsonString(std::string(nameOf(entry.fate))) +
         ",\"Why\":" + (entry.why.empty() ? "null" : jsonString(entry.why)) + ',' +
         (entry.details.empty() ? std::string(unknownDetails) : entry.details) +
         ",\"Seconds\":" + secondsText(time) + "}\n";
}

}  // namespace varnel
