#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "platform/PropertyList.h"

using namespace varnel;

namespace {

void require(bool truth) {
  if (!truth) std::abort();
}

}  // namespace

// The input is one property list as it arrives. What could be read can be written in its own encoding and in
// every other one that holds its texts, and what was written can be read again.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto list = readPropertyList({data, size});
  if (!list) return 0;
  const auto binary = writeBinaryPropertyList(*list);
  require(binary && readPropertyList(*binary, fileLimits));
  const auto xml = writeXmlPropertyList(*list);
  require(!xml || readPropertyList(*xml, fileLimits));
  return 0;
}
