#pragma once

#include <array>
#include <cstdint>
#include <initializer_list>
#include <string_view>

#include "base/Bytes.h"

namespace varnel {

/// The name of a NAS message of LTE (TS 24.301), NR (TS 24.501), or GSM and UMTS (TS 24.008). One whose
/// contents are ciphered is "Security Protected (ciphered)"; one that is not known is "Unknown".
std::string_view epsNASName(ByteView message);
std::string_view fiveGNASName(ByteView message);
std::string_view circuitNASName(ByteView message);

/// The name of an RR message of GSM (TS 44.018) by its type.
std::string_view gsmRRName(std::uint8_t type);

/// Names by a message type of eight bits. Empty where there is none.
class NamesByType {
 public:
  struct Entry {
    std::uint8_t type;
    std::string_view name;
  };
  consteval NamesByType(std::initializer_list<Entry> entries) {
    for (const Entry& entry : entries) {
      if (!_names.at(entry.type).empty()) throw "two names have this type";
      _names.at(entry.type) = entry.name;
    }
  }

  constexpr std::string_view operator[](std::uint8_t type) const { return _names[type]; }

 private:
  std::array<std::string_view, 256> _names{};
};

}  // namespace varnel
