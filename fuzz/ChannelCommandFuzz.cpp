#include <cstddef>
#include <cstdint>
#include <variant>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "fuzz/Require.h"
#include "programs/varnel-telephonyd/ChannelCommand.h"

using namespace varnel;

namespace {

// Whether the filter takes every message of this log type and code that is long enough to have a code, with
// and without the prefix.
bool takes(const CodeFilter& filter, std::uint8_t logType, std::int64_t code) {
  Bytes packet(13);
  packet[0] = logType;
  packet[3] = static_cast<std::uint8_t>(code);
  packet[4] = static_cast<std::uint8_t>(code >> 8);
  const bool bare = filter.takes(packet);
  packet.insert(packet.begin(), {0x81, 0});
  require(filter.takes(packet) == bare, "a prefix changes nothing");
  return bare;
}

void checkFilter(const CodeFilter& filter, std::uint8_t logType,
                 const std::optional<CodeFilter::Codes>& codes) {
  if (!codes) return;
  for (const std::int64_t code : *codes) {
    if (code >= 0 && code <= 0xFFFF) require(takes(filter, logType, code), "what was asked for is sent");
  }
}

}  // namespace

// The input is a command from a viewer to the telephony server. A command is a dictionary, and its filter
// takes the codes that it names.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto command = readChannelCommand({data, size});
  if (!command) return 0;
  const auto list = readPropertyList({data, size});
  require(list && list->dictionary(), "a command is a dictionary");
  if (const auto* start = std::get_if<StartRequest>(&*command)) {
    checkFilter(start->filter, 1, start->filter.modemCodes);
    checkFilter(start->filter, 0xFF, start->filter.serverCodes);
  }
  return 0;
}
