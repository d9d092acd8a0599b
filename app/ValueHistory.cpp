#include "app/ValueHistory.h"

#include <algorithm>
#include <functional>

#include "LogGenerator/Radios/SeenCells.h"
#include "app/RecordIdentity.h"
#include "base/ClockStep.h"

namespace varnel {

namespace {

// What an allocation takes beside what was asked for.
constexpr std::size_t allocationOverhead = 16;
// What the two maps and the list add for a series: links, keys, and hash values.
constexpr std::size_t linksOfSeries = 16 + 40 + 32 + 3 * allocationOverhead;

constexpr std::size_t bytesOfBuckets(std::size_t count) { return count * sizeof(void*) + allocationOverhead; }

// A deque has blocks of 512 bytes, and a place for each.
constexpr std::size_t bytesOfDeque(std::size_t count, std::size_t size) {
  constexpr std::size_t bytesOfBlock = 512;
  const std::size_t blocks = count / (bytesOfBlock / size) + 3;
  return blocks * (bytesOfBlock + allocationOverhead + 3 * sizeof(void*));
}

bool hasDigit(std::string_view text) {
  return std::ranges::any_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

// Stands for the moment when a value was written; two moments hardly ever have the same. 0: not known.
using Stamp = std::uint64_t;

Stamp stampOf(const std::optional<Time>& time) {
  if (!time) return 0;
  constexpr Stamp nanosecondsPerSecond = 1'000'000'000;
  const Stamp moment = static_cast<Stamp>(time->seconds) * nanosecondsPerSecond +
                       static_cast<Stamp>(static_cast<std::uint32_t>(time->nanoseconds));
  return std::max<Stamp>(moment, 1);
}

// A part of a stretch without samples, behind this one.
ValueHistory::Column standing(const ValueHistory::Sample& sample) {
  return {.isEmpty = false,
          .lowest = sample.value,
          .mean = sample.value,
          .highest = sample.value,
          .last = sample.value,
          .isRenewed = sample.isRenewed};
}

// `column.mean` is their sum until all are included.
void include(ValueHistory::Column& column, const ValueHistory::Sample& sample, bool joins) {
  if (column.count == 0) {
    column = standing(sample);
    column.mean = 0;
    column.followsGap = !joins;
  }
  column.lowest = std::min(column.lowest, sample.value);
  column.highest = std::max(column.highest, sample.value);
  column.last = sample.value;
  column.isRenewed |= sample.isRenewed;
  column.mean += sample.value;
  ++column.count;
}

Stamp stampOf(const std::string& text) { return std::hash<std::string>()(text) | 1; }

}  // namespace

struct ValueHistory::Series {
  std::string key;
  std::size_t nameStart, nameLength;  // in the key
  Number number;
  EntryFormats formats{};
  std::uint64_t formatsEdition = 0;
  std::string_view unit{};  // of a format, which lives as long as the program
  std::uint64_t lastGeneration = 0;
  Stamp writtenAt = 0;  // the last sample
  ValueSeries samples{};

  std::size_t bytes() const { return bytesWithKey(key.capacity()) + samples.bytes(); }
  static std::size_t bytesWithKey(std::size_t keyLength) {
    return sizeof(Series) + linksOfSeries + keyLength + 1 + allocationOverhead;
  }
};

/// Goes through a display and gives each number to its series.
class ValueHistory::Walk {
 public:
  explicit Walk(ValueHistory& history) : _history(history) {}

  void visitRoot(const VarnelModelNode& root) { visitEntries(root, 0); }

 private:
  // A part of the key, as long as this lives.
  class Part {
   public:
    Part(std::string& key, std::string_view mark, std::string_view text, std::string_view endMark = {})
        : _key(key), _length(key.size()) {
      key.append(mark).append(text).append(endMark);
    }
    ~Part() { _key.resize(_length); }
    Part(const Part&) = delete;
    Part& operator=(const Part&) = delete;

   private:
    std::string& _key;
    std::size_t _length;
  };

  void visitEntries(const VarnelModelNode& node, Stamp writtenAt) {
    for (const auto& entry : *node.childNodes()) {
      const Part part(_key, "/", entry->displayName());
      visitEntry(*entry, node, writtenAt);
    }
  }

  void visitEntry(const VarnelModelNode& entry, const VarnelModelNode& around, Stamp writtenAt) {
    _names.push_back(&entry.displayName());
    if (entry.value()) {
      visitLeaf(entry, writtenAt);
    } else if (isList(entry)) {
      visitList(entry, around);
    } else if (entry.childNodes()) {
      visitEntries(entry, 0);
    }
    _names.pop_back();
  }

  static bool isList(const VarnelModelNode& node) {
    const auto* const inner = dynamic_cast<const VarnelModelTreeNode*>(&node);
    return inner && inner->origin() == VarnelModelTreeNode::Origin::Array;
  }

  void visitList(const VarnelModelNode& list, const VarnelModelNode& around) {
    if (placesAreIdentities(list.displayName())) return visitEntries(list, 0);
    for (const auto& record : *list.childNodes()) {
      if (record->childNodes() && !isList(*record)) visitRecord(*record, list, around);
    }
  }

  void visitRecord(const VarnelModelNode& record, const VarnelModelNode& list,
                   const VarnelModelNode& around) {
    const RecordIdentity identity = identityOfRecord(record, list, around);
    if (identity.text.empty()) return;
    _names.push_back(&record.displayName());
    const Stamp lastSeen = lastSeenOf(record);
    for (const auto& entry : *record.childNodes()) {
      const Part inBrackets(_key, "[", entry->value() ? identity.ownRows : identity.text, "]");
      const Part part(_key, "/", entry->displayName());
      visitEntry(*entry, record, lastSeen);
    }
    _names.pop_back();
  }

  // The list as a whole is as new as the last cell that was seen, but each record tells when its cell was.
  static Stamp lastSeenOf(const VarnelModelNode& record) {
    for (const auto& entry : *record.childNodes()) {
      if (entry->value() && entry->displayName() == SeenCells::lastSeenEntry) return stampOf(*entry->value());
    }
    return 0;
  }

  void visitLeaf(const VarnelModelNode& leaf, Stamp writtenAt) {
    if (!hasDigit(*leaf.value())) return;
    if (writtenAt == 0) {
      const auto* const withTime = dynamic_cast<const VarnelModelLeafNode*>(&leaf);
      if (withTime) writtenAt = stampOf(withTime->writtenAt());
    }
    const Row row{leaf, _key.size() - leaf.displayName().size(), writtenAt};
    if (visitRow(row, Key::Plain)) return;
    const std::size_t length = _key.size();
    for (unsigned place = 2; place <= mostOfOneKey; ++place) {
      _key.append(" (").append(std::to_string(place)).append(")");
      const bool isDone = visitRow(row, Key::Plain);
      _key.resize(length);
      if (isDone) return;
    }
  }

  struct Row {
    const VarnelModelNode& leaf;
    std::size_t nameStart;  // in the key
    Stamp writtenAt;
  };
  enum class Key { Plain, WithUnit };

  // False when an earlier row of this display has the key.
  bool visitRow(const Row& row, Key kind) {
    const std::string& text = *row.leaf.value();
    const auto found = _history._byKey.find(_key);
    const bool isKnown = found != _history._byKey.end();
    if (isKnown && found->second->formatsEdition != _history._formatsEdition)
      setFormats(*found->second, formats());
    const EntryFormats formats = isKnown ? found->second->formats : this->formats();
    if (kind == Key::Plain && formats.haveSeveralUnits()) return visitRowWithUnit(row, formats.unitOf(text));
    if (isKnown && found->second->lastGeneration == _history.newest()) return false;
    const auto sample = StoredSample::ofNumber(formats.number(text));
    if (!sample) return true;
    const auto series =
        isKnown ? found->second : _history.makeSeries(_key, row.nameStart, row.leaf.displayName().size());
    if (series == _history._series.end()) return true;
    if (!isKnown) setFormats(*series, formats);
    series->unit = formats.unitOf(text);
    keep(row, series, *sample);
    return true;
  }

  bool visitRowWithUnit(const Row& row, std::string_view unit) {
    const Part part(_key, " in ", unit.empty() ? "1" : unit);
    return visitRow(row, Key::WithUnit);
  }

  EntryFormats formats() const {
    std::vector<std::string> path;
    path.reserve(_names.size());
    for (const std::string* const name : _names) path.push_back(*name);
    return _history._formats.at(path).formats;
  }

  void setFormats(Series& series, const EntryFormats& formats) const {
    series.formats = formats;
    series.formatsEdition = _history._formatsEdition;
  }

  void keep(const Row& row, SeriesList::iterator series, StoredSample sample) {
    const std::size_t count = series->samples.size();
    const bool isOther = count == 0 || series->samples[count - 1].digits != sample.digits ||
                         series->samples[count - 1].decimals != sample.decimals;
    sample.isRenewed = isOther || (row.writtenAt != 0 && row.writtenAt != series->writtenAt);
    series->writtenAt = row.writtenAt;
    _history.append(series, sample);
    _history.addRow(row.leaf, series->number);
  }

  ValueHistory& _history;
  std::string _key;
  std::vector<const std::string*> _names;
};

ValueHistory::ValueHistory(NumberFormats formats, const Limits& limits)
    : _limits(limits), _formats(std::move(formats)) {}

ValueHistory::~ValueHistory() = default;

void ValueHistory::setFormats(NumberFormats formats) {
  _formats = std::move(formats);
  ++_formatsEdition;
}

void ValueHistory::clear() {
  _rows = {};
  _root.reset();
  _byKey = {};
  _byNumber = {};
  _series.clear();
  _generations = {};
  _firstGeneration = 0;
  _bytesOfSeries = 0;
  _lastLoss.reset();
  _units.clear();
}

void ValueHistory::add(const std::shared_ptr<const VarnelModelNode>& root, Time now) {
  if (!root) return;
  addGeneration(now);
  dropOld();
  _rows.clear();
  _root = root;
  if (root->childNodes()) Walk(*this).visitRoot(*root);
  std::ranges::sort(_rows);
}

void ValueHistory::add(std::span<const Reading> readings, Time now) {
  addGeneration(now);
  dropOld();
  _rows.clear();
  _root.reset();
  for (const Reading& reading : readings) {
    const auto found = _byKey.find(reading.key);
    const bool isKnown = found != _byKey.end();
    if (isKnown && found->second->lastGeneration == newest()) continue;
    const bool isNameInside = reading.nameStart <= reading.key.size() &&
                              reading.nameLength <= reading.key.size() - reading.nameStart;
    if (!isNameInside) continue;
    const auto series =
        isKnown ? found->second : makeSeries(std::string(reading.key), reading.nameStart, reading.nameLength);
    if (series == _series.end()) continue;
    if (series->unit != reading.unit) series->unit = keptUnit(reading.unit);
    append(series, reading.sample);
  }
}

// There are only as many units as the decoders have, so the bound is never felt.
std::string_view ValueHistory::keptUnit(std::string_view unit) {
  constexpr std::size_t mostUnits = 256;
  const auto found = _units.find(unit);
  if (found != _units.end()) return *found;
  return _units.size() < mostUnits ? *_units.emplace(unit).first : std::string_view();
}

auto ValueHistory::newestReadings() const -> std::vector<Reading> {
  std::vector<Reading> readings;
  // Those on display come last.
  for (auto series = _series.rbegin(); series != _series.rend() && series->lastGeneration == newest();
       ++series) {
    const ValueSeries& samples = series->samples;
    readings.push_back(
        {series->key, series->nameStart, series->nameLength, series->unit, samples[samples.size() - 1]});
  }
  return readings;
}

void ValueHistory::addGeneration(Time now) {
  Generation generation{.time = now};
  if (_generations.empty()) {
    _clock = now;
  } else {
    const ClockStep step = clockStep(_clock, now);
    const Duration length = step == ClockStep::None ? durationBetween(_clock, now) : Duration();
    generation.at = _generations.back().at + length;
    generation.followsGap = length > longestStep || step == ClockStep::Ahead;
    if (step != ClockStep::Overtaking) _clock = now;
  }
  _generations.push_back(generation);
}

void ValueHistory::dropOld() {
  const Duration oldest = _generations.back().at - _limits.length;
  while (_generations.front().at < oldest || _generations.size() > mostGenerations) dropGeneration();
  // The newest generation needs memory too.
  while (!makeRoom(0) && _generations.size() > 1) dropGeneration();
}

void ValueHistory::dropGeneration() {
  _generations.pop_front();
  ++_firstGeneration;
  while (!_series.empty() && _series.front().lastGeneration < _firstGeneration) erase(_series.begin());
}

std::size_t ValueHistory::bytes() const {
  return sizeof(*this) + _bytesOfSeries + bytesOfDeque(_generations.size(), sizeof(Generation)) +
         _rows.capacity() * sizeof(_rows.front()) + allocationOverhead +
         bytesOfBuckets(_byKey.bucket_count()) + bytesOfBuckets(_byNumber.bucket_count());
}

bool ValueHistory::makeRoom(std::size_t bytesWanted) {
  while (bytes() + bytesWanted > _limits.bytes) {
    // One that the generation before this one had may still come.
    if (_series.empty() || _series.front().lastGeneration + 1 >= newest()) {
      noteLoss();
      return false;
    }
    erase(_series.begin());
    noteLoss();
  }
  return true;
}

void ValueHistory::erase(SeriesList::iterator series) {
  _bytesOfSeries -= series->bytes();
  _byKey.erase(series->key);
  _byNumber.erase(series->number);
  _series.erase(series);
}

auto ValueHistory::makeSeries(const std::string& key, std::size_t nameStart, std::size_t nameLength)
    -> SeriesList::iterator {
  std::size_t bytesWanted = Series::bytesWithKey(key.size()) + ValueSeries().bytesOfOneMore();
  // Old and new buckets exist at the same time.
  if (_byKey.size() + 1 > _byKey.bucket_count())
    bytesWanted += std::size_t{6} * bytesOfBuckets(_byKey.bucket_count());
  if (!makeRoom(bytesWanted)) return _series.end();
  const auto series = _series.insert(_series.end(), Series{.key = std::string(key),
                                                           .nameStart = nameStart,
                                                           .nameLength = nameLength,
                                                           .number = Number(_nextNumber++)});
  _byKey.emplace(series->key, series);
  _byNumber.emplace(series->number, series);
  _bytesOfSeries += series->bytes();
  return series;
}

void ValueHistory::append(SeriesList::iterator series, StoredSample sample) {
  // Making room must not take this one.
  series->lastGeneration = newest();
  _series.splice(_series.end(), _series, series);
  ValueSeries& samples = series->samples;
  _bytesOfSeries -= samples.bytes();
  std::size_t old = 0;
  while (old < samples.size() && generationOf(samples[old]) < _firstGeneration) ++old;
  if (old > 0) samples.dropFirst(old);
  _bytesOfSeries += samples.bytes();
  if (samples.isFull()) {
    if (samples.size() == 0 || makeRoom(samples.bytesOfOneMore())) {
      _bytesOfSeries -= samples.bytes();
      samples.addBlock();
      _bytesOfSeries += samples.bytes();
    } else {
      samples.reuseOldestBlock();
    }
  }
  sample.generation = newest() & StoredSample::generationMask;
  samples.add(sample);
}

void ValueHistory::addRow(const VarnelModelNode& row, Number number) {
  if (_rows.size() == _rows.capacity()) {
    const std::size_t more = std::max<std::size_t>(64, _rows.capacity());
    if (!makeRoom((_rows.capacity() + more) * sizeof(_rows.front()))) return;
    _rows.reserve(_rows.capacity() + more);
  }
  _rows.emplace_back(&row, number);
}

std::uint64_t ValueHistory::generationOf(const StoredSample& sample) const {
  return newest() - ((newest() - sample.generation) & StoredSample::generationMask);
}

const ValueHistory::Series* ValueHistory::find(Number number) const {
  const auto found = _byNumber.find(number);
  return found == _byNumber.end() ? nullptr : &*found->second;
}

std::optional<ValueHistory::Number> ValueHistory::seriesOf(const VarnelModelNode& row) const {
  const auto found =
      std::ranges::lower_bound(_rows, &row, {}, &std::pair<const VarnelModelNode*, Number>::first);
  if (found == _rows.end() || found->first != &row) return std::nullopt;
  return found->second;
}

std::optional<ValueHistory::Number> ValueHistory::seriesOfKey(std::string_view key) const {
  const auto found = _byKey.find(key);
  if (found == _byKey.end()) return std::nullopt;
  return found->second->number;
}

std::vector<ValueHistory::Number> ValueHistory::series() const {
  std::vector<Number> numbers;
  numbers.reserve(_series.size());
  for (const Series& series : _series) numbers.push_back(series.number);
  return numbers;
}

std::vector<ValueHistory::Number> ValueHistory::seriesOfUnit(std::string_view unit) const {
  std::vector<Number> numbers;
  for (const Series& series : _series) {
    if (series.unit == unit) numbers.push_back(series.number);
  }
  return numbers;
}

std::string_view ValueHistory::key(Number number) const {
  const Series* const series = find(number);
  return series ? std::string_view(series->key) : std::string_view();
}

std::string_view ValueHistory::name(Number number) const {
  const Series* const series = find(number);
  return series ? std::string_view(series->key).substr(series->nameStart, series->nameLength)
                : std::string_view();
}

std::string ValueHistory::record(Number number) const {
  const Series* const series = find(number);
  if (!series) return {};
  std::string text;
  std::string_view rest = std::string_view(series->key).substr(0, series->nameStart);
  for (auto begin = rest.find('['); begin != std::string_view::npos; begin = rest.find('[')) {
    rest.remove_prefix(begin + 1);
    if (!text.empty()) text += ", ";
    text += rest.substr(0, rest.find(']'));
  }
  return text;
}

std::string_view ValueHistory::unit(Number number) const {
  const Series* const series = find(number);
  return series ? series->unit : std::string_view();
}

ValueHistory::Stretch ValueHistory::whole() const {
  if (_generations.empty()) return {};
  return {_generations.front().at, _generations.back().at};
}

ValueHistory::Stretch ValueHistory::last(Duration length) const {
  const Duration end = whole().end;
  return {end - length, end};
}

Time ValueHistory::timeAt(Duration point) const {
  if (_generations.empty()) return {};
  auto found = std::ranges::upper_bound(_generations, point, {}, &Generation::at);
  if (found != _generations.begin()) --found;
  constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;
  std::int64_t nanoseconds = (point - found->at).count() % nanosecondsPerSecond + found->time.nanoseconds;
  std::int64_t seconds = (point - found->at).count() / nanosecondsPerSecond;
  if (nanoseconds < 0) {
    nanoseconds += nanosecondsPerSecond;
    --seconds;
  } else if (nanoseconds >= nanosecondsPerSecond) {
    nanoseconds -= nanosecondsPerSecond;
    ++seconds;
  }
  return {found->time.seconds + seconds, static_cast<std::int32_t>(nanoseconds)};
}

std::optional<ValueHistory::Duration> ValueHistory::pointAt(Time time) const {
  for (std::size_t i = _generations.size(); i-- > 0;) {
    if (_generations[i].time > time) continue;
    const Duration since = durationBetween(_generations[i].time, time);
    const bool isNewest = i + 1 == _generations.size();
    const Duration most = isNewest ? Duration(longestStep) : _generations[i + 1].at - _generations[i].at;
    // Later, the clock had been set already.
    if (since <= most) return _generations[i].at + since;
  }
  return std::nullopt;
}

auto ValueHistory::clockPieces(const Stretch& stretch) const -> std::vector<ClockPiece> {
  std::vector<ClockPiece> pieces;
  if (_generations.empty() || stretch.end < stretch.begin) return pieces;
  auto next = std::ranges::upper_bound(_generations, stretch.begin, {}, &Generation::at);
  auto earlier = next == _generations.begin() ? next : next - 1;
  pieces.push_back({stretch, timeAt(stretch.begin)});
  for (; next != _generations.end() && next->at <= stretch.end; earlier = next++) {
    const bool goesOn = durationBetween(earlier->time, next->time) == next->at - earlier->at;
    if (goesOn || next == earlier) continue;
    if (pieces.size() == mostClockPieces) break;
    pieces.back().stretch.end = next->at;
    pieces.push_back({{next->at, stretch.end}, next->time});
  }
  return pieces;
}

ValueHistory::Sample ValueHistory::sampleAt(const Series& series, std::size_t index) const {
  const StoredSample& stored = series.samples[index];
  const std::uint64_t number = generationOf(stored);
  const Generation& its = generation(number);
  const bool followsGap =
      its.followsGap || index == 0 || generationOf(series.samples[index - 1]) + 1 != number;
  return {its.at, its.time, stored.value(), stored.isRenewed != 0, followsGap};
}

std::pair<std::size_t, std::size_t> ValueHistory::placesOf(const Series& series,
                                                           const Stretch& stretch) const {
  const auto numberOf = [this](auto place) {
    return _firstGeneration + static_cast<std::uint64_t>(place - _generations.begin());
  };
  const auto placeOf = [&](std::uint64_t number) {
    std::size_t begin = 0, end = series.samples.size();
    while (begin < end) {
      const std::size_t middle = begin + (end - begin) / 2;
      if (generationOf(series.samples[middle]) < number) {
        begin = middle + 1;
      } else {
        end = middle;
      }
    }
    return begin;
  };
  return {placeOf(numberOf(std::ranges::lower_bound(_generations, stretch.begin, {}, &Generation::at))),
          placeOf(numberOf(std::ranges::upper_bound(_generations, stretch.end, {}, &Generation::at)))};
}

std::vector<ValueHistory::Sample> ValueHistory::samples(Number number, const Stretch& stretch) const {
  std::vector<Sample> found;
  const Series* const series = find(number);
  if (!series) return found;
  const auto [begin, end] = placesOf(*series, stretch);
  if (begin >= end) return found;
  found.reserve(end - begin);
  for (std::size_t i = begin; i < end; ++i) found.push_back(sampleAt(*series, i));
  return found;
}

ValueHistory::Summary ValueHistory::summary(Number number, const Stretch& stretch) const {
  Summary summary;
  const Series* const series = find(number);
  if (!series) return summary;
  const auto [begin, end] = placesOf(*series, stretch);
  double sum = 0;
  for (std::size_t i = begin; i < end; ++i) {
    const double value = series->samples[i].value();
    if (summary.count == 0) summary.lowest = summary.highest = value;
    summary.lowest = std::min(summary.lowest, value);
    summary.highest = std::max(summary.highest, value);
    summary.last = value;
    summary.decimals = std::max(summary.decimals, static_cast<unsigned>(series->samples[i].decimals));
    sum += value;
    ++summary.count;
  }
  if (summary.count > 0) summary.mean = sum / static_cast<double>(summary.count);
  return summary;
}

std::vector<ValueHistory::Column> ValueHistory::columns(Number number, const Stretch& stretch,
                                                        std::size_t count) const {
  std::vector<Column> columns(count);
  const Series* const series = find(number);
  if (!series || count == 0 || stretch.end < stretch.begin) return columns;
  const Duration width = (stretch.end - stretch.begin) / static_cast<std::int64_t>(count) + Duration(1);
  const auto [begin, end] = placesOf(*series, stretch);

  std::size_t next = 0;  // the first column behind the last sample
  std::optional<Sample> earlier;
  const auto fillUpTo = [&](std::size_t place) {
    for (; next < place; ++next) columns[next] = standing(*earlier);
  };
  if (begin > 0) earlier = sampleAt(*series, begin - 1);
  for (std::size_t i = begin; i < end; ++i) {
    const Sample sample = sampleAt(*series, i);
    const auto place = static_cast<std::size_t>((sample.at - stretch.begin) / width);
    const bool joins = earlier && !sample.followsGap;
    if (joins) fillUpTo(place);
    include(columns[place], sample, joins);
    next = place + 1;
    earlier = sample;
  }
  if (end < series->samples.size() && earlier && !sampleAt(*series, end).followsGap) fillUpTo(count);
  for (Column& column : columns) {
    if (column.count > 0) column.mean /= static_cast<double>(column.count);
  }
  return columns;
}

std::string ValueHistory::notice() const {
  if (!_lastLoss || _generations.back().at - *_lastLoss >= _limits.length) return {};
  const std::size_t mebibytes = _limits.bytes >> 20;
  return "The courses of all values do not fit into " + std::to_string(mebibytes) +
         " MiB: those of the values that were silent longest are gone";
}

}  // namespace varnel
