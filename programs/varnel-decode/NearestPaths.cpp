#include "programs/varnel-decode/NearestPaths.h"

#include <algorithm>
#include <numeric>
#include <optional>

#include "model/VarnelModelNode.h"

namespace varnel {

namespace {

constexpr std::size_t largestSize = 4 << 20;
constexpr std::size_t longestPath = 1000;  // longer paths would take too long
constexpr std::size_t mostSuggestions = 3;
constexpr std::size_t shortestPart = 3;  // a shorter part of a name is not looked for in longer names

// How many characters have to be inserted, removed, or replaced.
std::size_t editDistance(std::string_view from, std::string_view to) {
  std::vector<std::size_t> row(to.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (const char character : from) {
    std::size_t diagonal = row[0]++;
    for (std::size_t i = 0; i < to.size(); ++i) {
      const std::size_t replaced = diagonal + (character == to[i] ? 0 : 1);
      diagonal = row[i + 1];
      row[i + 1] = std::min({replaced, row[i] + 1, diagonal + 1});
    }
  }
  return row.back();
}

// Replaces each selection by the number of a record.
std::string withRowNumbers(std::string_view path) {
  std::string text;
  while (!path.empty()) {
    const std::size_t open = path.find('[');
    const std::size_t close = path.find(']', std::min(open, path.size()));
    if (close == std::string_view::npos) break;
    text += path.substr(0, open);
    text += text.ends_with('/') ? "0" : "/0";
    path.remove_prefix(close + 1);
  }
  return text += path;
}

struct Suggestion {
  std::size_t distance;
  std::string_view path;
};

// The distance, if it is at most a third of the length of the wanted path.
std::optional<std::size_t> nearbyDistance(std::string_view wanted, std::string_view path) {
  const std::size_t furthest = wanted.size() / 3;
  if (path.size() > wanted.size() + furthest || wanted.size() > path.size() + furthest) return std::nullopt;
  const std::size_t distance = editDistance(wanted, path);
  if (distance > furthest) return std::nullopt;
  return distance;
}

std::string_view parentOf(std::string_view path) { return path.substr(0, path.rfind('/') + 1); }

// "RSRP" is near "Average RSRP": a user may know only a part of a name.
bool namesPartOf(std::string_view wanted, std::string_view path) {
  const std::string_view part = wanted.substr(parentOf(wanted).size());
  return part.size() >= shortestPart &&
         path.substr(parentOf(path).size()).find(part) != std::string_view::npos;
}

std::optional<Suggestion> suggestion(std::string_view wanted, std::string_view path) {
  if (path.size() > wanted.size() && path.starts_with(wanted) && path[wanted.size()] == '/')
    return Suggestion{0, path};
  const auto distance = namesPartOf(wanted, path) ? nearbyDistance(parentOf(wanted), parentOf(path))
                                                  : nearbyDistance(wanted, path);
  if (!distance) return std::nullopt;
  return Suggestion{*distance, path};
}

}  // namespace

void NearestPaths::take(const Value& display) {
  if (_size > largestSize) return;
  PathDictionary paths;
  const auto root = VarnelModelNode::makeTreeFromObject_withPathDictionary(display, paths);
  for (const auto& [path, node] : paths) {
    if (!node->value() || _size > largestSize) continue;
    if (_paths.insert(path.substr(1)).second) _size += path.size();
  }
}

std::vector<std::string> NearestPaths::to(std::string_view path) const {
  if (path.starts_with('/')) path.remove_prefix(1);
  if (path.empty() || path.size() > longestPath) return {};
  const std::string wanted = withRowNumbers(path);
  std::vector<Suggestion> suggestions;
  for (const std::string& candidate : _paths)
    if (const auto found = suggestion(wanted, candidate)) suggestions.push_back(*found);
  std::ranges::stable_sort(suggestions, {}, &Suggestion::distance);
  if (suggestions.size() > mostSuggestions) suggestions.resize(mostSuggestions);
  std::vector<std::string> nearest;
  nearest.reserve(suggestions.size());
  for (const Suggestion& found : suggestions) nearest.emplace_back(found.path);
  return nearest;
}

std::string adviceOf(const std::vector<std::string>& nearest, std::string_view otherwise) {
  if (nearest.empty()) return std::string(otherwise);
  std::string advice = "did you mean ";
  for (std::size_t i = 0; i < nearest.size(); ++i) {
    if (i > 0) advice += i + 1 < nearest.size() ? ", " : " or ";
    advice.append("'").append(nearest[i]).append("'");
  }
  return advice + "?";
}

}  // namespace varnel
