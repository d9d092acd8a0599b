#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "app/ValueHistory.h"
#include "model/events/DisplayEvent.h"

namespace varnel {

/// A row of the display whose number has a course. All texts are for users, except the key.
struct TrendRow {
  std::string key;    ///< of its series in the history
  std::string name;   ///< "RSRP"
  std::string place;  ///< "LTE > Neighbors > Cells, EARFCN 1300, PCI 16"
  std::string unit;   ///< "dBm"; empty for a number without a unit
};

/// What the view of courses shows, and what it asks of the program. The view is in a module, which is linked
/// to no layer of the program: so this is an interface, and the types in it are plain.
class TrendSource {
 public:
  using Duration = ValueHistory::Duration;
  using Stretch = ValueHistory::Stretch;

  /// A moment by the clock of the displays.
  struct Moment {
    Time time;
    int offsetSeconds = 0;  ///< of the zone in which it is shown
  };
  struct Event {
    Duration at{};
    EventKind kind{};
    std::string_view kindName{};  ///< such as "handover"; lives as long as the program
    std::string text;
  };

  virtual ~TrendSource() = default;

  /// What the numbers are of: the file's name, or the technology.
  virtual std::string name() const = 0;
  /// The clock of the axis, such as "UTC+01:00"; absent where only the time since the start is known.
  virtual std::optional<std::string> clockName() const = 0;

  /// Those with a course, sorted by place and name.
  virtual std::vector<TrendRow> rows() const = 0;
  /// Nothing while there is no such row.
  virtual std::optional<TrendRow> row(const std::string& key) const = 0;

  virtual Stretch whole() const = 0;
  virtual Moment momentAt(Duration point) const = 0;
  virtual std::vector<ValueHistory::ClockPiece> clockPieces(const Stretch& stretch) const = 0;
  /// All columns are empty while there is no such row.
  virtual std::vector<ValueHistory::Column> columns(const std::string& key, const Stretch& stretch,
                                                    std::size_t count) const = 0;
  virtual ValueHistory::Summary summary(const std::string& key, const Stretch& stretch) const = 0;
  virtual std::vector<Event> events(const Stretch& stretch) const = 0;
  /// Where the file is played at present; absent when none is played.
  virtual std::optional<Duration> playingPosition() const = 0;
  /// Nothing is added any more, so a picture begins with everything.
  virtual bool isComplete() const = 0;

  /// What users should know of the history, such as what it lacks; empty when there is nothing to tell.
  virtual std::string remark() const = 0;
  /// How much of the file was read, 0 to 1; absent when nothing is being read.
  virtual std::optional<double> progress() const = 0;

  /// The picture has these rows now. The program may show them again later.
  virtual void rememberRows(const std::vector<std::string>& keys) = 0;
  /// The samples of these rows as comma-separated values.
  virtual std::string table(std::span<const std::string> keys, const Stretch& stretch) const = 0;
  /// Writes a file that the user has named. Returns why it was not written, as a sentence; empty when it was.
  virtual std::string save(const std::string& path, std::string_view bytes) = 0;
};

}  // namespace varnel
