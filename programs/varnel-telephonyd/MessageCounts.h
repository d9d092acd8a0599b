#pragma once

#include <cstdint>
#include <string>

namespace varnel {

/// What became of the messages of a stream. Each message that is due counts as received. Once its fate is
/// known, it also counts as one of the others. So `received` is the sum of `delivered`, `waiting`, `dropped`,
/// and `refused` at any time.
struct MessageCounts {
  std::uint64_t received = 0;
  std::uint64_t delivered = 0;    ///< given to the viewer's socket
  std::uint64_t waiting = 0;      ///< until the viewer has room
  std::uint64_t dropped = 0;      ///< the viewer had no room for it, or had gone
  std::uint64_t tooLong = 0;      ///< refused: longer than the channel allows
  std::uint64_t notAskedFor = 0;  ///< refused: the viewer has not asked for its log code

  std::uint64_t refused() const { return tooLong + notAskedFor; }
  MessageCounts& operator+=(const MessageCounts& other);
  bool operator==(const MessageCounts&) const = default;
};

/// The counts as part of a line, which tells of waiting messages only when there are some. Such as "messages:
/// 7 received, 4 delivered, 1 dropped, 2 refused (1 too long for the channel, 1 not asked for)".
std::string inWords(const MessageCounts& counts);

}  // namespace varnel
