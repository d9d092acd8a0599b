#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "app/EventHistory.h"
#include "app/ValueHistory.h"
#include "platform/Clock.h"
#include "programs/varnel/trends/TrendSource.h"

namespace varnel {

/// The courses in a history, for the view of courses.
class HistoryTrends final : public TrendSource {
 public:
  /// Everything must outlive the object. Functions may be empty.
  struct Parts {
    const ValueHistory& numbers;
    const EventHistory& events;
    /// What the numbers are of.
    std::function<std::string()> name{};
    /// The clock whose zone is that of the axis; null for UTC.
    const Clock* clock = nullptr;
    /// False where only the time since the start is known.
    std::function<bool()> isDated{};
    std::function<std::string()> remark{};
    std::function<std::optional<double>()> progress{};
    std::function<std::optional<Time>()> playedTime{};
    /// The file that must not be overwritten; empty when there is none.
    std::function<std::string()> input{};
    /// Nothing is added any more.
    bool isComplete = false;
  };

  explicit HistoryTrends(Parts parts) : _parts(std::move(parts)) {}

  /// The rows that a picture had last.
  const std::vector<std::string>& remembered() const { return _remembered; }

  std::string name() const override { return _parts.name ? _parts.name() : std::string(); }
  std::optional<std::string> clockName() const override;
  std::vector<TrendRow> rows() const override;
  std::optional<TrendRow> row(const std::string& key) const override;
  Stretch whole() const override { return _parts.numbers.whole(); }
  Moment momentAt(Duration point) const override;
  std::vector<ValueHistory::ClockPiece> clockPieces(const Stretch& stretch) const override {
    return _parts.numbers.clockPieces(stretch);
  }
  std::vector<ValueHistory::Column> columns(const std::string& key, const Stretch& stretch,
                                            std::size_t count) const override;
  ValueHistory::Summary summary(const std::string& key, const Stretch& stretch) const override;
  std::vector<Event> events(const Stretch& stretch) const override;
  std::optional<Duration> playingPosition() const override;
  bool isComplete() const override { return _parts.isComplete; }
  std::string remark() const override;
  std::optional<double> progress() const override;
  void rememberRows(const std::vector<std::string>& keys) override { _remembered = keys; }
  std::string table(std::span<const std::string> keys, const Stretch& stretch) const override;
  std::string save(const std::string& path, std::string_view bytes) override;

 private:
  TrendRow rowOf(ValueHistory::Number number) const;
  bool isDated() const { return !_parts.isDated || _parts.isDated(); }

  Parts _parts;
  std::vector<std::string> _remembered;
};

}  // namespace varnel
