#include "app/RowFacts.h"

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <limits>
#include <utility>

namespace varnel {

namespace {

constexpr std::chrono::seconds oldAge(60);
// A display has fewer paths. More come only from a modem that goes on inventing names.
constexpr std::size_t mostKinds = 8192;

bool isList(const VarnelModelNode& node) {
  const auto* const inner = dynamic_cast<const VarnelModelTreeNode*>(&node);
  return inner && inner->origin() == VarnelModelTreeNode::Origin::Array;
}

std::optional<Time> writtenAt(const VarnelModelNode& row) {
  const auto* const leaf = dynamic_cast<const VarnelModelLeafNode*>(&row);
  return leaf ? leaf->writtenAt() : std::nullopt;
}

// The last moment when a packet wrote a value of the record.
std::optional<Time> lastWriting(const VarnelModelNode& record) {
  std::optional<Time> last;
  for (const auto& child : *record.childNodes()) {
    const auto time = writtenAt(*child);
    if (time && (!last || *time > *last)) last = time;
  }
  return last;
}

CellLevel cellLevel(const std::optional<SignalLevel>& level) {
  if (!level) return CellLevel::None;
  constexpr CellLevel levels[] = {CellLevel::Poor, CellLevel::Fair, CellLevel::Good, CellLevel::Excellent};
  return levels[static_cast<std::size_t>(*level)];
}

}  // namespace

void RowFacts::setFormats(NumberFormats formats) {
  _kinds.clear();  // they are views of the former formats
  _formats = std::move(formats);
}

void RowFacts::follow(Node root, Display display) {
  _summaries.clear();
  _nextAging.reset();
  _display = display;
  _editionOfCourses = editionOfCourses();
  _root = std::move(root);
  _changes.follow(_root);
}

bool RowFacts::haveChanged(Display display) {
  const bool isOtherDisplay = std::exchange(_display, display) != display;
  const bool isAging = _nextAging && _sources.clock.now() >= *_nextAging;
  const auto edition = editionOfCourses();
  const bool areOtherCourses = std::exchange(_editionOfCourses, edition) != edition;
  if (!isOtherDisplay && !isAging && !areOtherCourses) return false;
  _nextAging.reset();
  return true;
}

CellFacts RowFacts::of(const Row& row) {
  CellFacts facts;
  if (_changes.contains(row.node)) facts.change = CellChange::Changed;
  if (!isIdentity(row.node.displayName())) facts.course = courseOf(row.node);
  if (!_sources.answers) return facts;
  facts.dimming = dimmingOf(row);
  if (row.node.value()) {
    if (const auto level = levelIn(row)) facts.level = cellLevel(level->level);
  } else if (isList(row.pane)) {
    RecordSummary summary = summaryOf(row);
    facts.summary = std::move(summary.parts);
    facts.level = cellLevel(summary.level);
  }
  return facts;
}

std::vector<std::optional<double>> RowFacts::courseOf(const VarnelModelNode& row) const {
  if (_sources.courses) return _sources.courses->course(row);
  return _sources.history ? recentCourse(*_sources.history, row) : std::vector<std::optional<double>>();
}

std::string RowFacts::explanation(const Row& row) {
  if (!_sources.answers) return {};
  NamePath names = row.namesOfPane;
  names.push_back(row.node.displayName());
  std::optional<SignalLevel> level;
  if (row.node.value()) {
    if (const auto found = levelIn(row)) level = found->level;
  }
  std::string text = _sources.answers->explanation(row.node, RowAnswers::pathOf(names), level);
  if (!_changes.contains(row.node)) return text;
  return text.append(text.empty() ? "" : "\n").append("It changed with the last refresh.");
}

const RowFacts::Kind& RowFacts::kindOf(const Row& row) {
  std::string path = RowAnswers::pathOf(row.namesOfPane).append("/").append(row.node.displayName());
  const auto known = _kinds.find(path);
  if (known != _kinds.end()) return known->second;
  if (_kinds.size() == mostKinds) _kinds.clear();
  NamePath names = row.namesOfPane;
  names.push_back(row.node.displayName());
  const EntryFormats formats = _formats.at(names).formats;
  Kind kind{formats, std::nullopt};
  // A level has a unit. So the resource is not read for anything else.
  if (formats.haveSeveralUnits() || !formats.unit().empty())
    kind.limits = _sources.answers->explanations().limitsOf(path);
  return _kinds.emplace(std::move(path), kind).first->second;
}

std::optional<RecordSummaries::Level> RowFacts::levelIn(const Row& leaf) {
  const std::string& text = *leaf.node.value();
  if (text.empty()) return std::nullopt;
  const auto& [formats, limits] = kindOf(leaf);
  if (!limits) return std::nullopt;
  const std::string_view number = formats.number(text);
  const std::string_view unit = formats.unitOf(text);
  if (number.empty() || unit.empty()) return std::nullopt;
  double value = 0;
  std::from_chars(number.data(), number.data() + number.size(), value);
  const auto level = Explanation::levelBy(*limits, value);
  return level ? std::optional(RecordSummaries::Level{number, unit, *level}) : std::nullopt;
}

RecordSummary RowFacts::summaryOf(const Row& record) {
  auto found = _summaries.find(&record.pane);
  if (found == _summaries.end()) {
    NamePath around = record.namesOfPane;
    if (!around.empty()) around.pop_back();
    const VarnelModelNode* const node = _root ? nodeUnderNames(*_root, around) : nullptr;
    if (!node) return {};
    found = _summaries.try_emplace(&record.pane, record.pane, *node).first;
  }
  return found->second.of(record.node, [&](const VarnelModelNode& leaf) {
    // The number of the record does not matter for what its leaves show.
    return levelIn({leaf, record.node, record.namesOfPane});
  });
}

CellDimming RowFacts::dimmingOf(const Row& row) {
  if (_display == Display::Standing) return CellDimming::All;
  std::optional<Time> time;
  if (row.node.value()) {
    time = writtenAt(row.node);
  } else if (isList(row.pane)) {
    time = lastWriting(row.node);
  }
  return time && isOld(*time) ? CellDimming::Value : CellDimming::None;
}

bool RowFacts::isOld(const Time& writtenAt) {
  const auto age = durationBetween(writtenAt, _sources.clock.now());
  // When it lies in the future, the clock was set back since then, so nobody knows how long ago that was. A
  // small step makes no value old.
  if (age >= oldAge || age <= -oldAge) return true;
  // A capture can say any time.
  if (writtenAt.seconds > std::numeric_limits<std::int64_t>::max() - oldAge.count()) return false;
  const Time old{writtenAt.seconds + oldAge.count(), writtenAt.nanoseconds};
  if (!_nextAging || old < *_nextAging) _nextAging = old;
  return false;
}

}  // namespace varnel
