#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "base/Log.h"
#include "tests/support/Describe.h"

namespace varnel {

/// A section decoder that decodes nothing: it writes each packet to the system log. `Section` supplies its
/// `name` and its `logCodes`.
template <class Section>
class RecordingDecoder : public Base {
 public:
  std::string_view getSectionName() const override { return Section::name; }
  std::vector<std::uint32_t> getLogCodeArray() const override { return Section::logCodes; }
  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) override {
    Bytes bytes;
    for (std::size_t offset = 0; offset < packet.size(); ++offset) bytes.push_back(packet.u8(offset));
    logWarning("%s gets %u: %s", Section::name, logCode, described(bytes));
  }

  /// The container that the decoder was given.
  const Value& section() const { return sectionRef.container(); }
};

}  // namespace varnel
