#pragma once

#include <cstddef>
#include <optional>

#include "base/Bytes.h"
#include "base/Value.h"

namespace varnel {

/// How much a property list may cost. A list that costs more is refused. Lists come from outside, so these
/// limits are checked before the parser sees any byte.
struct PropertyListLimits {
  std::size_t size;           ///< bytes of the list as it arrives, below 4 GiB
  std::size_t depth;          ///< containers within containers, the outermost one counted
  std::size_t expandedNodes;  ///< values and keys, each counted as often as it is referred to
  std::size_t expandedBytes;  ///< bytes of a binary list's texts and data, as often as they are referred to
  std::size_t keyPairs;  ///< squared number of keys, summed over the dictionaries: each is compared with each
  std::size_t entityMoves;  ///< entities of an XML text times its bytes, summed over the texts
  std::size_t pathBytes;    ///< bytes of the keys that lead to a value, one more each, summed over the values

  enum class Expansion {
    Allowed,        ///< up to these limits, however short the list is
    GrowsWithSize,  ///< a short list as far as a message, a longer one in proportion to its size
  } expansion = Expansion::Allowed;
};

/// For messages of the log channel and other input that nobody chose. Reading any message takes at most a few
/// times as long as reading an ordinary one of its size. A tenth of a second was the longest time measured.
inline constexpr PropertyListLimits messageLimits{
    .size = std::size_t{1} << 20,
    .depth = 64,
    .expandedNodes = std::size_t{1} << 16,
    .expandedBytes = std::size_t{4} << 20,
    .keyPairs = std::size_t{1} << 23,
    .entityMoves = std::size_t{1} << 30,
    .pathBytes = std::size_t{8} << 20,
};
/// For files that the user names: snapshots, templates. No user makes a short file that expands to a long
/// one.
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

/// Reads an XML or binary property list and keeps the order of its keys. A key that occurs twice keeps its
/// first place and gets its last value. Yields nothing
/// - for bytes that are no property list, or that break a limit;
/// - for a list with a UID or a set;
/// - for a text that the encoding cannot hold: U+0000 and bad UTF-8 or UTF-16, in XML also U+FFFE, U+FFFF,
///   and control characters other than tab, newline, and carriage return.
///
/// An integer of 2^63 or more becomes negative, with the same 64 bits. A date that does not fit into 32 bits
/// of seconds becomes the earliest date that does. The process's LC_NUMERIC must be "C".
std::optional<Value> readPropertyList(ByteView bytes, const PropertyListLimits& limits = messageLimits);

/// Writes a property list and keeps the order of its keys. Yields nothing
/// - for the absent value;
/// - for a text that the encoding cannot hold, as in reading;
/// - for containers nested deeper than in files, or containing themselves;
/// - for more than files may hold.
///
/// XML keeps whole seconds of dates and writes the real -0 as 0. A binary date can change by a microsecond.
/// All other values are kept. The process's LC_NUMERIC must be "C".
std::optional<Bytes> writeXmlPropertyList(const Value& value);
std::optional<Bytes> writeBinaryPropertyList(const Value& value);

}  // namespace varnel
