#include "programs/varnel-decode/CaptureReport.h"

#include "programs/shared/Timestamps.h"
#include "programs/varnel-decode/TreeWriters.h"

namespace varnel {

namespace {

constexpr std::string_view unknownDetails = R"("Records":null,"Left Out":null,"Unknown Versions":null)";

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
  return "{\"Path\":" + jsonString(entry.path) +
         ",\"Status\":" + jsonString(std::string(nameOf(entry.fate))) +
         ",\"Why\":" + (entry.why.empty() ? "null" : jsonString(entry.why)) + ',' +
         (entry.details.empty() ? std::string(unknownDetails) : entry.details) +
         ",\"Seconds\":" + secondsText(time) + "}\n";
}

}  // namespace varnel
