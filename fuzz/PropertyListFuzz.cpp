#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "fuzz/MessageRules.h"
#include "fuzz/Require.h"
#include "platform/Dictionary.h"
#include "platform/PropertyList.h"

using namespace varnel;

namespace {

bool holdsDate(const Value& value) {
  if (const Array* elements = value.array()) return std::ranges::any_of(*elements, holdsDate);
  const Dictionary* entries = value.dictionary();
  if (!entries) return value.date().has_value();
  return std::ranges::any_of(*entries, [](const auto& entry) { return holdsDate(entry.value); });
}

}  // namespace

// The input is one property list as it arrives. What could be read can be written in its own encoding and in
// every other one that holds its texts, and what was written can be read again.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto list = readPropertyList({data, size});
  if (!list) return 0;
  const auto binary = writeBinaryPropertyList(*list);
  require(binary.has_value(), "what could be read has a binary form");
  const auto again = readPropertyList(*binary, fileLimits);
  require(again.has_value(), "the binary form can be read");
  // Dates may come back a microsecond off.
  require(holdsDate(*list) || writeBinaryPropertyList(*again) == binary,
          "the binary form reads as the same list");
  const auto xml = writeXmlPropertyList(*list);
  require(xml || holdsTextStrangeToXml(*list), "XML refuses only texts that it cannot hold");
  require(!xml || readPropertyList(*xml, fileLimits), "the XML form can be read");
  return 0;
}
