#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "app/ValueSeries.h"
#include "base/Time.h"
#include "model/VarnelModelNode.h"

namespace varnel {

/// The numbers of the display over time: a series of samples for each row whose value is a number.
///
/// A series has a key. This is the path of its row, but a record of a list is named by what it is about
/// instead of its place: "/LTE/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRP" (`RecordIdentity`). Where several
/// rows of a display have the same key, the second one gets " (2)" after its key, the third one " (3)", and
/// so on. Where the values of one row may have different units, there is a series for each, with the unit in
/// its key: " in dBm", and " in 1" without a unit. Records of a list that say nothing about their identity
/// have no series, nor has a list of texts.
///
/// The times of samples are on an axis that only goes forward. It follows the clock of the generations, but
/// not when that clock was set: a step back, and a leap of more than a day, take no time on the axis.
class ValueHistory {
 public:
  using Duration = std::chrono::nanoseconds;

  struct Limits {
    Duration length = std::chrono::hours(1);    ///< older samples go
    std::size_t bytes = std::size_t{32} << 20;  ///< of all memory
  };
  /// Two generations that are farther apart have a gap between them.
  static constexpr std::chrono::seconds longestStep{10};
  /// More generations than these are not kept.
  static constexpr std::size_t mostGenerations = 65'536;
  /// Rows of one display that have the same key, beyond these, have no series.
  static constexpr unsigned mostOfOneKey = 16;

  /// Names a series of this history. Never names another one later.
  enum class Number : std::uint64_t {};

  /// A piece of the axis, with both ends.
  struct Stretch {
    Duration begin{}, end{};
  };
  struct Sample {
    Duration at{};  ///< on the axis
    Time time{};    ///< by the clock of the generations
    double value = 0;
    bool isRenewed = false;   ///< a packet has written the value since the sample before
    bool followsGap = false;  ///< nothing came between this sample and the one before
  };
  struct Summary {
    std::size_t count = 0;
    double lowest = 0, mean = 0, highest = 0, last = 0;  ///< 0 without samples
    unsigned decimals = 0;                               ///< of the sample that has most of them
  };
  /// What a part of a stretch holds, as wide as a column on the screen.
  struct Column {
    bool isEmpty = true;    ///< the row was not there at that time
    std::size_t count = 0;  ///< its samples; 0 where the value of an earlier one stands
    double lowest = 0, mean = 0, highest = 0, last = 0;
    bool isRenewed = false;   ///< a packet has written one of its samples
    bool followsGap = false;  ///< not to be joined with what is left of it
  };

  /// A number of a display, without the display: for whoever has the display in another process.
  struct Reading {
    std::string_view key;                       ///< of its series
    std::size_t nameStart = 0, nameLength = 0;  ///< the name of its row within the key
    std::string_view unit;
    StoredSample sample{};
  };
  /// A stretch in which the clock of the generations went on with the axis.
  struct ClockPiece {
    Stretch stretch;
    Time time;  ///< of its beginning
  };
  /// Of the pieces in a stretch, the later ones are not told.
  static constexpr std::size_t mostClockPieces = 64;

  explicit ValueHistory(NumberFormats formats = {}) : ValueHistory(std::move(formats), Limits()) {}
  ValueHistory(NumberFormats formats, const Limits& limits);
  ~ValueHistory();

  /// The display comes from another generator now. What was kept stays.
  void setFormats(NumberFormats formats);
  /// Forgets everything.
  void clear();

  /// Keeps the numbers of a display. `now` is the time of the generation: the clock's, or the capture's.
  void add(const std::shared_ptr<const VarnelModelNode>& root, Time now);

  /// Keeps the readings of a display. Those of one series beyond the first count for nothing.
  void add(std::span<const Reading> readings, Time now);
  /// The numbers of the display that was added last, in no order. They are valid until the next change.
  std::vector<Reading> newestReadings() const;

  /// The series of a row of the display that was added last. Nothing for a row without one: a section, a
  /// text, a number without an identity.
  std::optional<Number> seriesOf(const VarnelModelNode& row) const;
  /// The series with a key. Its row may be gone.
  std::optional<Number> seriesOfKey(std::string_view key) const;
  /// All series, in no order.
  std::vector<Number> series() const;
  /// Those with this unit.
  std::vector<Number> seriesOfUnit(std::string_view unit) const;
  /// False when the series has gone, for its age or for want of memory.
  bool has(Number number) const { return find(number) != nullptr; }

  // Of a series that has gone, the following yield nothing: empty texts, no samples.

  std::string_view key(Number number) const;
  /// The name of its row.
  std::string_view name(Number number) const;
  /// What the records are about that its row is in, such as "EARFCN 1300, PCI 16"; empty outside of lists.
  std::string record(Number number) const;
  /// Such as "dBm"; empty for a number without a unit.
  std::string_view unit(Number number) const;

  /// From the oldest to the newest generation; both ends are 0 when there is none.
  Stretch whole() const;
  /// The time before the newest generation, as long as this.
  Stretch last(Duration length) const;
  /// The time of the clock at a point of the axis. Between two generations, it goes on from the earlier one.
  Time timeAt(Duration point) const;

  /// The point of the axis that the clock showed as this time; the latest one, if it was set. Nothing when
  /// the history does not have it.
  std::optional<Duration> pointAt(Time time) const;
  /// Where the clock went on with the axis, in order. Empty without generations.
  std::vector<ClockPiece> clockPieces(const Stretch& stretch) const;

  std::vector<Sample> samples(Number number, const Stretch& stretch) const;
  /// Of every sample of the stretch, renewed or not: all of them were on display.
  Summary summary(Number number, const Stretch& stretch) const;
  /// The stretch in so many parts of the same length. A value stands until the next generation, so a column
  /// between two samples without a gap has the value of the first one.
  std::vector<Column> columns(Number number, const Stretch& stretch, std::size_t count) const;

  /// All memory of this history, with what the allocator adds, but without the formats and the display that
  /// was added last. At most `Limits::bytes`.
  std::size_t bytes() const;
  /// Tells the user for an hour that series had to go before their time. Empty when there is nothing to tell.
  std::string notice() const;

 private:
  struct Generation {
    Duration at{};
    Time time{};
    bool followsGap = false;
  };
  struct Series;
  using SeriesList = std::list<Series>;  // the one that was silent longest comes first
  class Walk;

  void addGeneration(Time now);
  void dropOld();
  void dropGeneration();
  const Generation& generation(std::uint64_t number) const { return _generations[number - _firstGeneration]; }
  std::uint64_t newest() const { return _firstGeneration + _generations.size() - 1; }
  std::uint64_t generationOf(const StoredSample& sample) const;

  Sample sampleAt(const Series& series, std::size_t index) const;
  /// The places in the series of the first sample of a stretch, and of the first one behind it.
  std::pair<std::size_t, std::size_t> placesOf(const Series& series, const Stretch& stretch) const;

  /// The end of the list when there is no room for it.
  SeriesList::iterator makeSeries(const std::string& key, std::size_t nameStart, std::size_t nameLength);
  void addRow(const VarnelModelNode& row, Number number);
  std::string_view keptUnit(std::string_view unit);
  /// Keeps the sample, and less of the oldest ones when there is no room for it.
  void append(SeriesList::iterator series, StoredSample sample);
  /// Lets series go that were silent longest. False when those that are left are still on display.
  bool makeRoom(std::size_t bytes);
  void erase(SeriesList::iterator series);
  void noteLoss() { _lastLoss = _generations.back().at; }
  const Series* find(Number number) const;

  Limits _limits;
  NumberFormats _formats;
  std::uint64_t _formatsEdition = 0;

  std::deque<Generation> _generations;
  std::uint64_t _firstGeneration = 0;  // the number of the first one
  Time _clock;                         // the time from which the next step of the clock counts

  SeriesList _series;
  std::unordered_map<std::string_view, SeriesList::iterator> _byKey;
  std::unordered_map<Number, SeriesList::iterator> _byNumber;
  std::uint64_t _nextNumber = 0;
  std::size_t _bytesOfSeries = 0;
  std::optional<Duration> _lastLoss;
  std::set<std::string, std::less<>> _units;  // of readings

  std::shared_ptr<const VarnelModelNode> _root;                  // keeps the rows below alive
  std::vector<std::pair<const VarnelModelNode*, Number>> _rows;  // by address
};

}  // namespace varnel
