#pragma once

#include <QVBoxLayout>
#include <QWidget>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/NavigationStack.h"
#include "widgets/HeaderWidget.h"
#include "widgets/NoticeWidget.h"
#include "widgets/RecordTableWidget.h"
#include "widgets/TableWidget.h"
#include "widgets/ToolbarWidget.h"

namespace varnel {

/// One pane of a navigation stack: title bar, notice, table, and toolbar.
class PaneWidget final : public QWidget, public TablePane {
 public:
  PaneWidget();

  TableView& table() override { return _table; }
  void setTitle(std::string_view title) override;
  void setToolbarItems(std::vector<ToolbarItem> items, Animation animation) override;
  void resignFirstResponder() override;

  TableWidget& tableWidget() { return _table; }
  HeaderWidget& header() { return _header; }
  ToolbarWidget& toolbar() { return _toolbar; }
  NoticeWidget& notice() { return _notice; }
  /// What is on the screen of a stack's pane.
  enum class Role {
    Top,     ///< everything
    Beside,  ///< the top pane is beside it and has toolbar and notice for both
  };
  /// The toolbar is hidden before the first call.
  void showAs(Role role, bool hasToolbar);
  /// The observer is called when the title has changed.
  void setTitleObserver(std::function<void()> observer) { _titleObserver = std::move(observer); }
  /// Makes no more calls from now on.
  void fallSilent();

  /// What the pane asks for the records of its list.
  struct RecordSource {
    std::function<bool()> hasRecords;                    ///< whether the rows are records
    std::function<std::optional<RecordList>()> records;  ///< nothing when the list has gone
  };
  /// Without a source the pane shows rows only.
  void setRecordSource(RecordSource source) { _source = std::move(source); }
  /// Whether the pane offers to show its records as a table with columns. While it does, the title bar has a
  /// button for that.
  bool offersRecords() const { return _offersRecords; }
  /// The records as a table with columns; null while the pane shows rows.
  RecordTableWidget* recordTable() const { return _records; }
  /// Shows the records in place of the rows. Does nothing unless the pane offers it.
  void showRecords();
  void showRows();
  /// Marks the row with this name as open beside the pane; null for none.
  void markOpenRow(const QString& name);
  /// Paler marks of rows: commands are for a row of another pane.
  void setPale(bool isPale);
  /// Gives the keyboard focus to what is shown of the list.
  void takeKeyboard(Qt::FocusReason reason);
  /// The names from this pane's node to what has the keyboard focus: the current row, and in the table with
  /// columns also the current column.
  std::vector<std::string> pathOfFocus() const;

 protected:
  void showEvent(QShowEvent* event) override;

 private:
  void tableWasLoaded();
  void refreshRecords();
  void showSideButton();

  QVBoxLayout _column;
  HeaderWidget _header;
  NoticeWidget _notice;
  TableWidget _table;
  ToolbarWidget _toolbar;
  std::function<void()> _titleObserver;
  RecordSource _source;
  bool _offersRecords = false;
  QString _openRow;
  bool _isPale = false;
  RecordTableWidget* _records = nullptr;  // a child
};

}  // namespace varnel
