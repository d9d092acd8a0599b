#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <vector>

#include "LogGenerator/Base.h"
#include "base/Log.h"

namespace varnel {

/// One log code of a decoder. A packet shorter than the minimum, header included, is dropped silently.
template <class Decoder>
struct PacketHandler {
  std::uint32_t logCode;
  std::size_t minimumLength;
  void (Decoder::*decode)(const Packet& packet);
};

/// All log codes of a decoder, in the order in which it subscribes to them. As a static member it keeps its
/// elements for the whole life of the program.
template <class Decoder>
using PacketHandlers = std::initializer_list<PacketHandler<Decoder>>;

/// What becomes of a log code that a decoder does not list.
enum class UnknownCodes { Logged, Ignored };

inline void logUnknownCode(std::uint32_t logCode) {
  logError("Received an unknown log message: %d", logCode);
}

/// The common steps of a decoder: its trace line, the log-code test, the length test, the handler. `Decoder`
/// supplies the static members `sectionName`, `traceLine` and `handlers`, the table of its log codes, and may
/// replace the two constants below.
template <class Decoder>
class SectionDecoder : public Base {
 public:
  static constexpr int tracePriority = logWarningPriority;
  static constexpr UnknownCodes unknownCodes = UnknownCodes::Logged;

  std::string_view getSectionName() const final { return Decoder::sectionName; }

  std::vector<std::uint32_t> getLogCodeArray() const final {
    std::vector<std::uint32_t> codes;
    for (const auto& handler : Decoder::handlers) codes.push_back(handler.logCode);
    return codes;
  }

  std::size_t minimumLength(std::uint32_t logCode) const final {
    for (const auto& handler : Decoder::handlers) {
      if (handler.logCode == logCode) return handler.minimumLength;
    }
    return 0;
  }

  void updateWithData_logCode(const Packet& packet, std::uint32_t logCode) final {
    logLine(Decoder::tracePriority, "%s", Decoder::traceLine);
    for (const auto& handler : Decoder::handlers) {
      if (handler.logCode != logCode) continue;
      if (packet.size() >= handler.minimumLength) (static_cast<Decoder*>(this)->*handler.decode)(packet);
      return;
    }
    if constexpr (Decoder::unknownCodes == UnknownCodes::Logged) logUnknownCode(logCode);
  }
};

}  // namespace varnel
