#pragma once

#include <QApplication>
#include <QTest>
#include <QWheelEvent>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "app/VarnelCell.h"
#include "widgets/FontMetrics.h"
#include "widgets/PaneWidget.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {

/// The longest time that something may take on a busy machine.
constexpr int patience_ms = 60'000;

/// A row of a test's table: a leaf if it has a value, else an inner node.
struct TestRow {
  std::string name;
  std::optional<std::string> value{};
  CellFacts facts{};
  std::string explanation{};
};

/// A delegate that shows rows like a pane, and records the calls.
class TestRows : public TableViewDelegate {
 public:
  explicit TestRows(std::vector<TestRow> rows) : rows(std::move(rows)) {}

  std::size_t tableView_numberOfRowsInSection(TableView&, std::size_t) override { return rows.size(); }
  std::unique_ptr<TableCell> tableView_cellForRowAtIndexPath(TableView& table,
                                                             const IndexPath& path) override {
    asked.push_back(path.row);
    const TestRow& row = rows.at(path.row);
    std::unique_ptr<VarnelCell> cell(static_cast<VarnelCell*>(table.dequeueReusableCell("row").release()));
    if (!cell) {
      ++made;
      const auto make = row.value ? VarnelCell::initWithStyle_reuseIdentifier
                                  : VarnelCell::initWithStyleKey_reuseIdentifier;
      cell = make(table, _metrics, CellStyle::NameAndDetail, "row");
    }
    cell->key().setText(row.name);
    cell->cellView().setAccessory(row.value ? CellAccessory::None : CellAccessory::DisclosureIndicator);
    if (cell->value()) cell->value()->setText(row.value.value_or(""));
    cell->cellView().setFacts(CellFacts(row.facts));
    row.value ? cell->setLayout() : cell->setLayoutKey();
    return cell;
  }
  void tableView_showFactsInCell(TableView&, TableCell& cell, const IndexPath& path) override {
    cell.cellView().setFacts(CellFacts(rows.at(path.row).facts));
  }
  std::string tableView_explanationOfRow(TableView&, const IndexPath& path) override {
    explained.push_back(path.row);
    return rows.at(path.row).explanation;
  }
  void tableView_didSelectRowAtIndexPath(TableView& table, const std::optional<IndexPath>& path) override {
    chosen.push_back(path->row);
    if (rows.at(path->row).value) table.deselectRow(*path, Animation::None);
  }

  std::vector<TestRow> rows;
  std::vector<std::size_t> asked;      ///< rows for which the table asked for a cell
  std::vector<std::size_t> chosen;     ///< rows that the user has chosen
  std::vector<std::size_t> explained;  ///< rows whose explanation the table wanted
  unsigned made = 0;                   ///< cells made

 private:
  FontMetrics _metrics;
};

/// This many leaves named "Row 0", "Row 1", and so on. Their values are the given text and the number.
inline std::vector<TestRow> leaves(std::size_t count, const std::string& value = "") {
  std::vector<TestRow> rows;
  for (std::size_t i = 0; i < count; ++i)
    rows.push_back({"Row " + std::to_string(i), value + std::to_string(i)});
  return rows;
}

/// Turns the mouse's wheel over the widget by this many logical pixels. Positive is up or to the left.
inline void turnWheel(QWidget& widget, const QPoint& position, const QPoint& pixels,
                      Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
  QWheelEvent event(position, widget.mapToGlobal(position), QPoint(), pixels * 2, Qt::NoButton, modifiers,
                    Qt::NoScrollPhase, false);
  QApplication::sendEvent(&widget, &event);
}

/// Counts how often widgets paint themselves.
class PaintCounter : public QObject {
 public:
  void watch(QWidget& widget) { widget.installEventFilter(this); }
  bool eventFilter(QObject* watched, QEvent* event) override {
    if (event->type() == QEvent::Paint) painted.push_back(watched);
    return false;
  }

  std::vector<QObject*> painted;
};

/// A controller that records the calls of its stack. Its pane's table has no rows unless a test sets some.
class TestController : public PaneController {
 public:
  TestController(std::string name, std::vector<std::string>& events)
      : _name(std::move(name)), _events(events) {
    pane().setTitle(_name);
  }
  TablePane& pane() override { return _pane; }
  PaneWidget& widget() { return _pane; }
  const std::string& name() const { return _name; }
  void viewWillAppear(Animation) override { _events.push_back(_name + " will appear"); }
  void viewWillDisappear(Animation) override {
    _events.push_back(_name + " will disappear");
    _pane.resignFirstResponder();
  }

 private:
  std::string _name;
  std::vector<std::string>& _events;
  PaneWidget _pane;
};

}  // namespace varnel
