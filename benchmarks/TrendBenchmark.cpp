#include <benchmark/benchmark.h>

#include <QApplication>
#include <QEvent>
#include <cstdlib>
#include <string>
#include <vector>

#include "app/EventHistory.h"
#include "app/ValueHistory.h"
#include "programs/varnel/HistoryTrends.h"
#include "programs/varnel/trends/TrendPageWidget.h"

namespace varnel {
namespace {

constexpr std::int64_t start = 1'700'000'000;
constexpr int displaysPerHour = 1800;

// An hour of four rows with two units, and an event per minute.
class Hour {
 public:
  Hour() {
    for (int row = 0; row < 4; ++row) keys.push_back("/LTE/Cells[PCI " + std::to_string(row) + "]/Level");
    for (; _displays <= displaysPerHour; ++_displays) addDisplay();
    for (int minute = 0; minute < 60; ++minute)
      _events.add({{start + 60 * minute, 0}, EventKind::Handover, "LTE/Serving Cell", "PCI 1", "PCI 2"},
                  std::chrono::minutes(minute));
  }

  void addDisplay() {
    std::vector<ValueHistory::Reading> readings;
    for (std::size_t row = 0; row < keys.size(); ++row) {
      const std::size_t nameStart = keys[row].rfind('/') + 1;
      const std::string number = std::to_string(-80 - static_cast<int>((_displays * (row + 3)) % 17)) + ".5";
      readings.push_back({keys[row], nameStart, keys[row].size() - nameStart, row < 2 ? "dBm" : "dB",
                          *StoredSample::ofNumber(number)});
    }
    _numbers.add(readings, {start + 2 * static_cast<std::int64_t>(_displays), 0});
  }
  void addNextDisplay() {
    ++_displays;
    addDisplay();
  }

  std::vector<std::string> keys;

 private:
  ValueHistory _numbers;
  EventHistory _events;
  std::size_t _displays = 0;

 public:
  HistoryTrends source{{.numbers = _numbers, .events = _events}};
};

void paint(QWidget& window) {
  QCoreApplication::processEvents();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::UpdateRequest);
  window.repaint();
}

// The time from the next display until the picture with its numbers is painted. The argument is the minutes
// that the picture shows.
void nextDisplayInATrendOfFourRows(benchmark::State& state) {
  Hour hour;
  TrendPageWidget page(hour.source);
  for (const std::string& key : hour.keys) page.addRow(key);
  page.view().stretch().showLast(std::chrono::minutes(state.range(0)));
  page.resize(900, 700);
  page.show();
  paint(page);
  for (auto _ : state) {
    hour.addNextDisplay();
    page.refresh();
    paint(page);
  }
}
BENCHMARK(nextDisplayInATrendOfFourRows)->Arg(10)->Arg(60)->Unit(benchmark::kMillisecond);

void cursorInATrendOfFourRows(benchmark::State& state) {
  Hour hour;
  TrendPageWidget page(hour.source);
  for (const std::string& key : hour.keys) page.addRow(key);
  page.resize(900, 700);
  page.show();
  paint(page);
  int place = 0;
  for (auto _ : state) {
    page.view().showCursor(++place % 500 + 100);
    paint(page);
  }
}
BENCHMARK(cursorInATrendOfFourRows)->Unit(benchmark::kMillisecond);

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
  benchmark::Initialize(&argumentCount, arguments);
  const QApplication application(argumentCount, arguments);
  benchmark::RunSpecifiedBenchmarks();
}
