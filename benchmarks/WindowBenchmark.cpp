#include <benchmark/benchmark.h>

#include <QApplication>
#include <QElapsedTimer>
#include <QEvent>
#include <QTableWidget>
#include <QVBoxLayout>
#include <cstdlib>
#include <memory>
#include <string>

#include "LogGenerator/Field.h"
#include "app/RowAnswers.h"
#include "app/RowFacts.h"
#include "app/ValueHistory.h"
#include "app/VarnelPaneController.h"
#include "widgets/PaneWidget.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {
namespace {

constexpr std::size_t rowCount = 60;

const std::string sectionName = "Serving Cell";

class NoSaving : public SaveControl {
 public:
  bool allowSaveButton() const override { return true; }
  void showSaveView() override {}
  void closeSaveViewLater() override {}
  void snapshotWasWritten(const FileWriting&) override {}
};

// A pane with this many leaves, whose values contain the number.
std::shared_ptr<const VarnelModelNode> nodeOf(std::size_t rows, unsigned number) {
  VarnelModelNode::Children children;
  for (std::size_t row = 0; row < rows; ++row) {
    children.push_back(std::make_shared<VarnelModelLeafNode>(
        "Measurement " + std::to_string(row), "-" + std::to_string(60 + (row + number) % 60) + ".25 dBm"));
  }
  return std::make_shared<VarnelModelTreeNode>(sectionName, std::move(children),
                                               VarnelModelTreeNode::Origin::Dictionary);
}

// Knows a level for each of those leaves.
class LevelOfEachRow final : public Resources {
 public:
  Value propertyList(std::string_view) const override {
    const Value rows = Value::ofDictionary(), limits = Value::ofDictionary(), levels = Value::ofDictionary(),
                all = Value::ofDictionary();
    for (std::size_t row = 0; row < rowCount; ++row) {
      const Value entry = Value::ofDictionary();
      entry.dictionary()->set("Meaning", Value("How strong it is."));
      entry.dictionary()->set("Level", Value("Power"));
      rows.dictionary()->set("Measurement " + std::to_string(row), entry);
    }
    for (const auto& [name, limit] :
         {std::pair("Fair", -100), {"Good", -90}, {"Excellent", -80}, {"Highest", 0}})
      limits.dictionary()->set(name, Value::ofInteger(limit));
    levels.dictionary()->set("Power", limits);
    all.dictionary()->set("Rows", rows);
    all.dictionary()->set("Levels", levels);
    return all;
  }
  std::vector<std::string> propertyListPaths() const override { return {}; }
};

// Its time is that of the newest display.
class DisplayClock final : public Clock {
 public:
  Time now() const override { return time; }
  TimeZone zoneAt(Time) const override { return {}; }
  Time time{1700000000, 0};
};

// What is known of the rows beside their texts: four minutes of courses, levels, and changes.
struct Known {
  Known() {
    NumberFormats formats;
    for (std::size_t row = 0; row < rowCount; ++row)
      formats.add(sectionName, "Measurement " + std::to_string(row), real("%.2f dBm"));
    history.setFormats(formats);
    facts.setFormats(formats);
    for (unsigned number = 0; number < 120; ++number) add(number);
  }
  // Two seconds later the display is another one.
  std::shared_ptr<const VarnelModelNode> add(unsigned number) {
    clock.time.seconds += 2;
    const auto tree =
        std::make_shared<VarnelModelTreeNode>("Varnel", VarnelModelNode::Children{nodeOf(rowCount, number)},
                                              VarnelModelTreeNode::Origin::Dictionary);
    history.add(tree, clock.time);
    facts.follow(tree, RowFacts::Display::Renewed);
    return tree;
  }

  LevelOfEachRow resources;
  DisplayClock clock;
  ValueHistory history;
  RowAnswers answers{resources, clock, history};
  RowFacts facts{{clock, &history, &answers}};
};

// A visible window with the root pane.
struct Shown {
  explicit Shown(std::size_t rows, const Rect& frame, RowFacts* facts = nullptr)
      : root(std::make_shared<VarnelPaneController>(userInterface, saveControl, nullptr, "/", facts)) {
    root->setStatus_isLoading("Updated 2024-03-01 at 14:05:09", false);
    root->reloadWithNode(nodeOf(rows, 0));
    stack = userInterface.makeNavigationStack(root);
    window = userInterface.makeWindow(frame);
    window->setRoot(*stack);
    window->makeKeyAndVisible();
  }

  NoSaving saveControl;
  WidgetUserInterface userInterface{{}};
  std::shared_ptr<VarnelPaneController> root;
  std::unique_ptr<NavigationStack> stack;
  std::unique_ptr<Window> window;
};

// Paints what is waiting to be painted.
void paint(QWidget& window) {
  QCoreApplication::processEvents();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::UpdateRequest);
  window.repaint();
}

void waitForAnimations() {
  QElapsedTimer timer;
  timer.start();
  while (!timer.hasExpired(1000)) QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
}

QWidget& widgetOf(Window& window) { return static_cast<WindowWidget&>(window); }

// The time from changing every value of 60 visible rows until all are painted.
void refreshOf60ChangedRows(benchmark::State& state) {
  Shown shown(rowCount, {0, 0, 480, 60 * 50 + 96});
  paint(widgetOf(*shown.window));
  unsigned number = 0;
  for (auto _ : state) {
    shown.root->reloadWithNode(nodeOf(rowCount, ++number));
    paint(widgetOf(*shown.window));
  }
}
BENCHMARK(refreshOf60ChangedRows)->Unit(benchmark::kMillisecond);

// The same with everything that stands beside the texts: sparklines of four minutes, levels, and marks of
// change. Every one of them is another one each time.
void refreshOf60ChangedRowsWithTrends(benchmark::State& state) {
  Known known;
  Shown shown(rowCount, {0, 0, 480, 60 * 50 + 96}, &known.facts);
  unsigned number = 0;
  shown.root->reloadWithNode(known.add(number));
  shown.root->openRow(sectionName);
  auto& section = static_cast<VarnelPaneController&>(*shown.stack->topController());
  waitForAnimations();
  for (auto _ : state) {
    const auto tree = known.add(++number);
    shown.root->reloadWithNode(tree);
    section.reloadWithNode(tree->childNodes()->front());
    paint(widgetOf(*shown.window));
  }
}
BENCHMARK(refreshOf60ChangedRowsWithTrends)->Unit(benchmark::kMillisecond);

// The same with unchanged values.
void refreshOf60UnchangedRows(benchmark::State& state) {
  Shown shown(rowCount, {0, 0, 480, 60 * 50 + 96});
  paint(widgetOf(*shown.window));
  const auto node = nodeOf(rowCount, 0);
  for (auto _ : state) {
    shown.root->reloadWithNode(node);
    QCoreApplication::processEvents();
  }
}
BENCHMARK(refreshOf60UnchangedRows)->Unit(benchmark::kMillisecond);

void firstPaintedPane(benchmark::State& state) {
  for (auto _ : state) {
    Shown shown(12, {0, 0, 480, 800});
    paint(widgetOf(*shown.window));
  }
}
BENCHMARK(firstPaintedPane)->Unit(benchmark::kMillisecond);

// The comparison for the first painted pane: the toolkit's own window with one empty table.
void emptyWindowWithOneTable(benchmark::State& state) {
  for (auto _ : state) {
    QWidget window;
    QVBoxLayout column(&window);
    QTableWidget table;
    column.addWidget(&table);
    window.resize(480, 800);
    window.show();
    paint(window);
  }
}
BENCHMARK(emptyWindowWithOneTable)->Unit(benchmark::kMillisecond);

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
  benchmark::Initialize(&argumentCount, arguments);
  const QApplication application(argumentCount, arguments);
  benchmark::RunSpecifiedBenchmarks();
}
