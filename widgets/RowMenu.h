#pragma once

#include <QList>
#include <QMenu>
#include <QPointer>
#include <utility>

#include "widgets/WindowWidget.h"

namespace varnel {

/// The middle of the row with the keyboard's focus on the screen, or else that of the window.
QPoint placeOfFocus(const WindowWidget& window);

/// The menu of the row with the keyboard's focus: the actions of the row, then the others of the window, so
/// that everything can be had without a keyboard. The right mouse button, a finger that rests, and the Menu
/// key open it.
class RowMenu final : public QObject {
  Q_OBJECT

 public:
  /// The window owns the menu. The actions that the window has by now come last. Those that it gets later are
  /// in the menu too.
  explicit RowMenu(WindowWidget& window);

  /// These come first.
  void setRowActions(QList<QAction*> actions) { _rowActions = std::move(actions); }
  /// This one is not in the menu.
  void leaveOut(const QAction& action) { _leftOut = &action; }

  /// How much room an item has.
  enum class Items { ForMouse, ForFinger };

  /// Opens at the focused row, or in the middle of the window.
  void open();
  /// Opens at this place of the screen. Does nothing while it is open.
  void openAt(const QPoint& place, Items items);
  /// Null while it is not open.
  QMenu* menu() const { return _menu; }

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void offerWhatApplies();
  void showKeysIfTheyFit();

  WindowWidget& _window;
  const QList<QAction*> _lastActions;
  QList<QAction*> _rowActions;
  const QAction* _leftOut = nullptr;
  QPointer<QMenu> _menu;
};

}  // namespace varnel
