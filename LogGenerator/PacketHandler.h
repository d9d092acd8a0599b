#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "LogGenerator/Field.h"

namespace varnel {

class Section;
class SectionDecoder;

/// One log code of a decoder, and what its packets show: a field table, or what a function makes of them. A
/// packet that is shorter than the minimum length, header included, is dropped silently.
struct PacketHandler {
  using Function = void (*)(Section& section, const Packet& packet);
  using Method = void (*)(SectionDecoder& decoder, const Packet& packet);

  /// The entries of a key section. Does not compile when a field lies past the minimum length.
  template <std::size_t size>
  consteval PacketHandler(std::uint32_t code, std::size_t minimum, const Field (&table)[size])
      : logCode(code), minimumLength(minimum), fields(table) {
    if (extent(table) > minimum) throw "a field lies past the minimum length";
  }
  consteval PacketHandler(std::uint32_t code, std::size_t minimum, Function itsFunction)
      : logCode(code), minimumLength(minimum), function(itsFunction) {}
  /// The same for a function that makes records from a table.
  template <std::size_t size>
  consteval PacketHandler(std::uint32_t code, std::size_t minimum, Function itsFunction,
                          const Field (&recordTable)[size])
      : PacketHandler(code, minimum, itsFunction) {
    fields = recordTable;
  }
  /// A member function, given as `calling<&Decoder::update>`, for a decoder with more members than its
  /// section.
  consteval PacketHandler(std::uint32_t code, std::size_t minimum, Method itsMethod)
      : logCode(code), minimumLength(minimum), method(itsMethod) {}

  std::uint32_t logCode;
  std::size_t minimumLength;
  std::span<const Field> fields{};  ///< the fields of the entries, or of the records that the function makes
  Function function = nullptr;
  Method method = nullptr;
};

}  // namespace varnel
