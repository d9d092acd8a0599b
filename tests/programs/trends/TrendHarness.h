#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "app/EventHistory.h"
#include "app/ValueHistory.h"
#include "programs/varnel/HistoryTrends.h"

namespace varnel {

/// A history with two rows, and what tests do with it. Its clock shows 2023-11-14 22:13:20 UTC at 0 s.
class TrendHarness : public testing::Test {
 protected:
  static constexpr std::int64_t start = 1'700'000'000;
  static constexpr const char* level = "/LTE/Serving Cell/RSRP";
  static constexpr const char* quality = "/LTE/Neighbors/Cells[EARFCN 1300, PCI 16]/RSRQ";

  static ValueHistory::Reading reading(std::string_view key, std::string_view unit, std::string_view number,
                                       bool isRenewed = true) {
    StoredSample sample = *StoredSample::ofNumber(number);
    sample.isRenewed = isRenewed;
    const std::size_t nameStart = key.rfind('/') + 1;
    return {key, nameStart, key.size() - nameStart, unit, sample};
  }
  /// Empty texts: the row is not on display.
  void show(std::int64_t second, std::string_view rsrp, std::string_view rsrq = {}, bool isRenewed = true) {
    std::vector<ValueHistory::Reading> readings;
    if (!rsrp.empty()) readings.push_back(reading(level, "dBm", rsrp, isRenewed));
    if (!rsrq.empty()) readings.push_back(reading(quality, "dB", rsrq));
    numbers.add(readings, {start + second, 0});
  }
  void addEvent(EventKind kind, std::int64_t second) {
    events.add({{start + second, 0}, kind, "LTE/Serving Cell", "PCI 16", "PCI 22"},
               std::chrono::seconds(second));
  }

  ValueHistory numbers;
  EventHistory events;
  std::string input;
  std::string remark;
  std::optional<double> progress;
  bool isDated = true;
  HistoryTrends source{{.numbers = numbers,
                        .events = events,
                        .name = [] { return "a <capture>"; },
                        .isDated = [this] { return isDated; },
                        .remark = [this] { return remark; },
                        .progress = [this] { return progress; },
                        .input = [this] { return input; }}};
};

}  // namespace varnel
