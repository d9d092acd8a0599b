#pragma once

#include <QLabel>
#include <QLineEdit>
#include <QPointF>
#include <QSortFilterProxyModel>
#include <QStandardItemModel>
#include <QTreeView>
#include <QWidget>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "programs/varnel/trends/TrendSource.h"

class QTouchEvent;

namespace varnel {

/// The rows that have a course, to choose those of a picture: first those that the picture has, then the
/// others, grouped by their units. A line of text above them finds rows by words of their names and places.
class RowChooser final : public QWidget {
  Q_OBJECT

 public:
  struct Wishes {
    /// A row was chosen, or is not wanted any more. False when the picture has no room for it.
    std::function<bool(const std::string& key, bool isWanted)> choose;
    std::function<void()> done;
  };

  RowChooser(Wishes wishes, QWidget* parent);

  /// Shows the rows; those with these keys are chosen.
  void show(const std::vector<TrendRow>& rows, const std::vector<std::string>& chosen);

  QLineEdit& words() { return *_words; }
  QTreeView& tree() { return *_tree; }

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  QStandardItem* addGroup(const QString& title);
  static void addRow(QStandardItem& group, const TrendRow& row, Qt::CheckState state);
  void turn(const QModelIndex& index);
  void takeTouch(QTouchEvent& event);
  void showFound();

  Wishes _wishes;
  QStandardItemModel _rows;
  QSortFilterProxyModel _found;
  QLineEdit* _words;
  QTreeView* _tree;
  QLabel* _nothing;
  std::optional<QPointF> _tapBegan;  // set while the touch may still become a tap
};

}  // namespace varnel
