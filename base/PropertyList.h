#pragma once

#include <cstddef>
#include <optional>

#include "base/Bytes.h"
#include "base/Value.h"

namespace varnel {

/// What a property list may cost before it is refused. Lists come from outside: these bounds are checked
/// before any of the bytes reach the library that parses them.
struct PropertyListLimits {
  std::size_t size;           ///< bytes of the list as it arrives, below 4 GiB
  std::size_t depth;          ///< containers within containers, the outermost one counted
  std::size_t expandedNodes;  ///< values and keys, each counted as often as it is referred to
  std::size_t expandedBytes;  ///< bytes of a binary list's texts and data, counted likewise
  std::size_t keyPairs;  ///< squared number of keys, summed over the dictionaries: each may meet each other
  std::size_t entityMoves;  ///< entities of an XML text times its bytes, summed over the texts
  std::size_t pathBytes;    ///< bytes of the keys that lead to a value, one more each, summed over the values

  enum class Expansion {
    Allowed,        ///< up to these bounds, however short the list
    GrowsWithSize,  ///< a short list no further than a message, a longer one in proportion to its size
  } expansion = Expansion::Allowed;
};

/// For messages of the log channel and whatever else arrives by itself. Whatever the message, reading it
/// takes at most a few times as long as an ordinary one of that size: up to a tenth of a second was measured.
inline constexpr PropertyListLimits messageLimits{
    .size = std::size_t{1} << 20,
    .depth = 64,
    .expandedNodes = std::size_t{1} << 16,
    .expandedBytes = std::size_t{4} << 20,
    .keyPairs = std::size_t{1} << 23,
    .entityMoves = std::size_t{1} << 30,
    .pathBytes = std::size_t{8} << 20,
};
/// For files that the user names: snapshots, templates. A short file that expands to a long one is no work of
/// a user's.
inline constexpr PropertyListLimits fileLimits{
    .size = std::size_t{256} << 20,
    .depth = 128,
    .expandedNodes = std::size_t{4} << 20,
    .expandedBytes = std::size_t{256} << 20,
    .keyPairs = std::size_t{1} << 30,
    .entityMoves = std::size_t{1} << 36,
    .pathBytes = std::size_t{1} << 30,
    .expansion = PropertyListLimits::Expansion::GrowsWithSize,
};

/// Reads an XML or binary property list, the order of keys kept; of a key that occurs twice the first place
/// and the last value. Nothing is returned for bytes that are neither, that break a limit or hold a UID or a
/// set, and for texts that their encoding cannot hold: U+0000 and bad UTF-8 or UTF-16 in both, in XML the
/// other control characters too (but tab, newline and carriage return), U+FFFE and U+FFFF. Integers of 2^63
/// and more come out negative, as the same 64 bits. Dates that 32 bits of seconds cannot hold come out as the
/// earliest one that they can. The process's LC_NUMERIC must be "C".
std::optional<Value> readPropertyList(ByteView bytes, const PropertyListLimits& limits = messageLimits);

/// Writes a property list, the order of keys kept. Nothing is returned for what has no property-list form:
/// the absent value, a text that its encoding cannot hold (as in reading), nesting deeper than that of files
/// or without end, more than files may hold. XML keeps whole seconds of dates and writes the real -0 as 0,
/// binary dates may come back a microsecond off; else all values are kept. The process's LC_NUMERIC must be
/// "C".
std::optional<Bytes> writeXmlPropertyList(const Value& value);
std::optional<Bytes> writeBinaryPropertyList(const Value& value);

}  // namespace varnel
