#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "platform/Log.h"

namespace varnel {

/// One log code of a decoder. A packet shorter than the minimum, header included, is dropped silently.
template <class Decoder>
struct PacketHandler {
  std::uint32_t logCode;
  std::size_t minimumLength;
  void (Decoder::*decode)(const Packet& packet);
};

inline void logUnknownCode(std::uint32_t logCode) {
  logError("Received an unknown log message: %d", logCode);
}

/// The common steps of a decoder: its trace line, the log-code test, the length test, the handler. `Decoder`
/// supplies `sectionName`, `traceLine` and the static function `handlers()`, the table of its log codes.
template <class Decoder>
class SectionDecoder : public Base {
 public:
  std::string_view getSectionName() const final { return Decoder::sectionName; }

  std::vector<std::uint32_t> getLogCodeArray() const final {
    std::vector<std::uint32_t> codes;
    for (const auto& handler : Decoder::handlers()) codes.push_back(handler.logCode);
    return codes;
  }

  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final {
    logWarning("%s", Decoder::traceLine);
    for (const auto& handler : Decoder::handlers()) {
      if (handler.logCode != logCode) continue;
      if (packet.size() >= handler.minimumLength) (static_cast<Decoder*>(this)->*handler.decode)(packet);
      return;
    }
    logUnknownCode(logCode);
  }
};

}  // namespace varnel
