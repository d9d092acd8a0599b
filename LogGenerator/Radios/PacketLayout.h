#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "LogGenerator/Field.h"

namespace varnel {

class Section;
class VersionedDecoder;

/// What one version of a packet, or of a subpacket, looks like. Other than in `PacketHandler`, offsets and
/// lengths leave out the packet's header: they count from the payload's first byte, or from the subpacket's.
struct PacketLayout {
  using Function = void (*)(Section& section, const Packet& body);
  using Method = void (*)(VersionedDecoder& decoder, const Packet& body);

  /// The entries of a key section. Does not compile when a field lies past the minimum length.
  template <std::size_t size>
  consteval PacketLayout(std::uint32_t code, std::uint32_t itsVersion, std::size_t minimum,
                         const Field (&table)[size])
      : logCode(code), version(itsVersion), minimumLength(minimum), fields(table) {
    if (extent(table) > minimum) throw "a field lies past the minimum length";
  }
  consteval PacketLayout(std::uint32_t code, std::uint32_t itsVersion, std::size_t minimum,
                         Function itsFunction)
      : logCode(code), version(itsVersion), minimumLength(minimum), function(itsFunction) {}
  /// A member function, given as `calling<&Decoder::update>`.
  consteval PacketLayout(std::uint32_t code, std::uint32_t itsVersion, std::size_t minimum, Method itsMethod)
      : logCode(code), version(itsVersion), minimumLength(minimum), method(itsMethod) {}

  /// The same layout for a subpacket with this id and version, in a packet of the version. The minimum length
  /// includes the subpacket's four bytes of id, version and size.
  consteval PacketLayout inSubpacket(std::uint8_t id, std::uint8_t itsVersion) const {
    PacketLayout layout = *this;
    layout.subpacket = id;
    layout.subpacketVersion = itsVersion;
    return layout;
  }

  std::uint32_t logCode, version;
  std::size_t minimumLength;
  std::uint8_t subpacket = 0, subpacketVersion = 0;  ///< 0: of the packet itself
  std::span<const Field> fields{};
  Function function = nullptr;
  Method method = nullptr;
};

}  // namespace varnel
