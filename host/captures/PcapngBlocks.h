#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "base/Bytes.h"
#include "base/Time.h"

namespace varnel::pcapng {

/// An interface of a pcapng file. Its time stamps are nanoseconds, and packets are whole.
struct Interface {
  std::uint16_t linkType;
  std::optional<std::string_view> name{};
  std::optional<std::string_view> description{};
};

enum class Direction : std::uint8_t { Unknown = 0, Inbound = 1, Outbound = 2 };

/// A packet of a pcapng file. A time before 1970 becomes 1970, and a time after 2554 becomes the last one
/// that fits.
struct Packet {
  std::uint32_t interface;  ///< its number, which counts from 0
  Time time;
  ByteView bytes;
  std::string_view comment{};  ///< UTF-8; empty for none
  Direction direction = Direction::Unknown;
};

/// Each appends a block. A file begins with a section, and an interface comes before its packets. A text
/// loses what is beyond 1024 bytes.
void appendSection(Bytes& file);
void appendInterface(Bytes& file, const Interface& interface);
void appendPacket(Bytes& file, const Packet& packet);

}  // namespace varnel::pcapng
