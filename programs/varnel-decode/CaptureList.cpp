#include "programs/varnel-decode/CaptureList.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <climits>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <numeric>
#include <queue>
#include <stdexcept>
#include <system_error>
#include <utility>

namespace varnel {

namespace {

constexpr unsigned mostParts = 1'000'000;

struct CloseUnlessStandard {
  void operator()(std::FILE* file) const {
    if (file != stdin) std::fclose(file);
  }
};
using File = std::unique_ptr<std::FILE, CloseUnlessStandard>;

[[noreturn]] void failToRead(const std::string& name) {
  throw std::system_error(errno, std::generic_category(), "cannot read the list " + name);
}

std::optional<unsigned> numberIn(std::string_view text) {
  unsigned number = 0;
  const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (failure != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

std::string asFile(std::string_view name) { return name == "-" ? "./-" : std::string(name); }

// What a list with sizes begins with. Each of its other entries is a size in bytes, a space, and a name.
constexpr std::string_view sizedListMark = "varnel-list 1";
// What it begins with in any version.
constexpr std::string_view anySizedListMark = "varnel-list ";

// The digits of the version in the first entry of a list with sizes; empty for another list.
std::string_view versionIn(std::string_view firstEntry) {
  if (!firstEntry.starts_with(anySizedListMark)) return {};
  const std::string_view version = firstEntry.substr(anySizedListMark.size());
  return version.substr(0, std::min(version.find_first_not_of("0123456789"), version.size()));
}

// Takes the size from the beginning of an entry.
std::uint64_t takeSize(std::string_view& entry, const std::string& listName) {
  std::uint64_t size = 0;
  const auto [end, failure] = std::from_chars(entry.data(), entry.data() + entry.size(), size);
  if (failure != std::errc() || end == entry.data() + entry.size() || *end != ' ')
    throw std::runtime_error(listName + " is damaged: an entry in it has no size");
  entry.remove_prefix(static_cast<std::size_t>(end - entry.data()) + 1);
  return size;
}

}  // namespace

std::optional<Part> partNamed(std::string_view text) {
  const std::size_t slash = text.find('/');
  if (slash == std::string_view::npos) return std::nullopt;
  const auto number = numberIn(text.substr(0, slash)), count = numberIn(text.substr(slash + 1));
  if (!number || !count || *number < 1 || *number > *count || *count > mostParts) return std::nullopt;
  return Part{*number, *count};
}

CaptureList capturesIn(std::string_view list, const std::string& listName) {
  const char separator = list.find('\0') == std::string_view::npos ? '\n' : '\0';
  std::vector<std::string_view> names;
  names.reserve(static_cast<std::size_t>(std::ranges::count(list, separator)) + 1);
  const std::string_view first =
      separator == '\0' ? list.substr(0, list.find(separator)) : std::string_view();
  const bool hasSizes = first == sizedListMark;
  if (const std::string_view version = versionIn(first); !hasSizes && !version.empty())
    throw std::runtime_error(listName + " is a list with sizes of version " + std::string(version) +
                             ", which this program does not know; write it again with its --write-list");
  std::vector<std::uint64_t> sizes;
  if (hasSizes) {
    list.remove_prefix(sizedListMark.size() + 1);
    sizes.reserve(names.capacity());
  }
  while (!list.empty()) {
    const std::size_t end = std::min(list.find(separator), list.size());
    std::string_view name = list.substr(0, end);
    list.remove_prefix(std::min(end + 1, list.size()));
    const std::uint64_t size = hasSizes ? takeSize(name, listName) : 0;
    if (name.size() >= PATH_MAX)
      throw std::runtime_error(listName + " is no list of captures: a name in it has " +
                               std::to_string(name.size()) + " characters");
    if (name.empty()) continue;
    names.push_back(name);
    if (hasSizes) sizes.push_back(size);
  }
  // There may be very many names, and what is needed only here must leave no holes in the memory. So there is
  // no set of them.
  std::vector<std::size_t> sorted(names.size());
  std::iota(sorted.begin(), sorted.end(), std::size_t{0});
  std::ranges::stable_sort(sorted, {}, [&](std::size_t i) { return names[i]; });
  std::vector<bool> occursAgain(names.size());
  for (std::size_t i = 1; i < sorted.size(); ++i)
    occursAgain[sorted[i]] = names[sorted[i]] == names[sorted[i - 1]];
  CaptureList captures;
  captures.names.reserve(names.size());
  captures.sizes.reserve(sizes.size());
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (occursAgain[i]) continue;
    captures.names.push_back(asFile(names[i]));
    if (hasSizes) captures.sizes.push_back(sizes[i]);
  }
  return captures;
}

std::string listWithSizes(const CaptureList& captures) {
  std::string list(sizedListMark);
  list += '\0';
  for (std::size_t i = 0; i < captures.names.size(); ++i)
    list.append(std::to_string(captures.sizes.at(i))).append(" ").append(captures.names[i]) += '\0';
  return list;
}

CaptureList readCaptureList(const std::string& path) {
  const std::string name = path == "-" ? "standard input" : path;
  const File file(path == "-" ? stdin : std::fopen(path.c_str(), "rbe"));
  if (!file) failToRead(name);
  std::string list;
  char piece[1 << 16];
  while (const std::size_t count = std::fread(piece, 1, sizeof piece, file.get())) list.append(piece, count);
  if (std::ferror(file.get())) failToRead(name);
  return capturesIn(list, name);
}

std::vector<std::uint64_t> sizesOf(const std::vector<std::string>& captures) {
  std::vector<std::uint64_t> sizes;
  sizes.reserve(captures.size());
  for (const std::string& capture : captures) {
    std::error_code failure;
    const std::uintmax_t size = std::filesystem::file_size(capture, failure);
    sizes.push_back(failure ? 0 : size);
  }
  return sizes;
}

std::vector<std::string> shareOf(const std::vector<std::string>& captures,
                                 const std::vector<std::uint64_t>& sizes, Part part) {
  std::vector<std::size_t> bySize(captures.size());
  std::iota(bySize.begin(), bySize.end(), std::size_t{0});
  std::ranges::stable_sort(bySize, std::ranges::greater(), [&](std::size_t i) { return sizes[i]; });
  // A capture takes time even when it is empty.
  constexpr std::uint64_t startingCost = 4096;
  using Load = std::pair<std::uint64_t, unsigned>;  // bytes, and the part that has them
  std::priority_queue<Load, std::vector<Load>, std::greater<>> loads;
  for (unsigned number = 1; number <= part.count; ++number) loads.emplace(0, number);
  std::vector<std::size_t> chosen;
  for (const std::size_t i : bySize) {
    const auto [bytes, number] = loads.top();
    loads.pop();
    if (number == part.number) chosen.push_back(i);
    loads.emplace(bytes + sizes[i] + startingCost, number);
  }
  std::ranges::sort(chosen);
  std::vector<std::string> share;
  share.reserve(chosen.size());
  for (const std::size_t i : chosen) share.push_back(captures[i]);
  return share;
}

}  // namespace varnel
