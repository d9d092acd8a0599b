#include <benchmark/benchmark.h>

#include <QApplication>
#include <QEvent>
#include <QTableWidget>
#include <QVBoxLayout>
#include <cstdlib>
#include <memory>
#include <string>

#include "app/VarnelPaneController.h"
#include "widgets/PaneWidget.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {
namespace {

constexpr std::size_t rowCount = 60;

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
  return std::make_shared<VarnelModelTreeNode>("Serving Cell", std::move(children),
                                               VarnelModelTreeNode::Origin::Dictionary);
}

// A visible window with the root pane.
struct Shown {
  Shown(std::size_t rows, const Rect& frame) {
    root->setStatus_isLoading("Updated 2024-03-01 at 14:05:09", false);
    root->reloadWithNode(nodeOf(rows, 0));
    stack = userInterface.makeNavigationStack(root);
    window = userInterface.makeWindow(frame);
    window->setRoot(*stack);
    window->makeKeyAndVisible();
  }

  NoSaving saveControl;
  WidgetUserInterface userInterface{{}};
  std::shared_ptr<VarnelPaneController> root =
      std::make_shared<VarnelPaneController>(userInterface, saveControl, nullptr, "/");
  std::unique_ptr<NavigationStack> stack;
  std::unique_ptr<Window> window;
};

// Paints what is waiting to be painted.
void paint(QWidget& window) {
  QCoreApplication::processEvents();
  QCoreApplication::sendPostedEvents(nullptr, QEvent::UpdateRequest);
  window.repaint();
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
