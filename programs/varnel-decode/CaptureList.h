#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace varnel {

/// One of several parts of a list, each for another machine.
struct Part {
  unsigned number = 1;  ///< 1 to `count`
  unsigned count = 1;
};

/// The part that a text like "3/8" names; nothing for any other text, and for a part that does not exist.
std::optional<Part> partNamed(std::string_view text);

/// What a list says.
struct CaptureList {
  std::vector<std::string> names{};
  std::vector<std::uint64_t> sizes{};  ///< of each capture; empty unless the list tells them
};

/// The names in a list. If the list has a NUL character, each name ends with NUL, otherwise with a newline. A
/// name that occurs again is left out, and so are empty names. The name "-" is that of a file. Throws
/// std::runtime_error for a name that no file can have, because it is too long, and for a list with sizes
/// that is damaged, or has a version that is not known.
CaptureList capturesIn(std::string_view list, const std::string& listName);

/// Reads such a list; "-" is standard input. Throws std::runtime_error also when it cannot be read.
CaptureList readCaptureList(const std::string& path);

/// A list with the sizes, from which each machine comes to the same parts, whatever has become of the
/// captures since then.
std::string listWithSizes(const CaptureList& captures);

/// The bytes of each capture; 0 for a file that cannot be found and for anything that is no file.
std::vector<std::uint64_t> sizesOf(const std::vector<std::string>& captures);

/// The part of the captures, in their order. Every capture is in exactly one part. The largest captures are
/// dealt out first, each to the part that has the fewest bytes. So parts take about the same time, and each
/// machine that sees the same list and the same sizes comes to the same parts.
std::vector<std::string> shareOf(const std::vector<std::string>& captures,
                                 const std::vector<std::uint64_t>& sizes, Part part);

}  // namespace varnel
