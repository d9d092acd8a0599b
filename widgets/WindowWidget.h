#pragma once

#include <QAction>
#include <QPointer>
#include <QWidget>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/ui/Window.h"
#include "widgets/NavigationWidget.h"
#include "widgets/PageWidget.h"

namespace varnel {

/// The application's window: the stack, a page that may lie above it, and a bar that may stand below it. What
/// else the user can do are its actions, each with its keys. Ctrl+R starts over, Ctrl+Q closes the window.
class WindowWidget final : public QWidget, public Window {
 public:
  /// What the user may want from the application itself.
  struct Wishes {
    std::function<void()> close{};
    std::function<void()> startOver{};
  };

  /// As large as the frame. The desktop decides where it is.
  WindowWidget(const Rect& frame, Wishes wishes);
  ~WindowWidget() override;

  void setRoot(NavigationStack& stack) override;
  void makeKeyAndVisible() override;
  void setTitle(std::string_view title) override;
  void hide() override { QWidget::hide(); }

  /// Adds an action that the keys cause: the first of them is its usual key. It does nothing while a save
  /// screen or an alert has the keyboard.
  QAction& addCommand(const QString& text, const QList<QKeySequence>& keys, std::function<void()> act);
  /// Menus show the action as one that cannot be chosen while this says no. Its keys act all the same.
  void offerOnlyIf(const QAction& action, std::function<bool()> applies) {
    _conditions.insert_or_assign(&action, std::move(applies));
  }
  /// Whether menus offer the action now.
  bool offers(const QAction& action) const;
  /// Lays a page with this content above the stack, in place of an earlier page. It covers the whole stack.
  void showPage(const QString& title, std::unique_ptr<QWidget> content);
  /// True while a save screen or an alert has the keyboard.
  bool isCovered() const;
  /// Null before `setRoot`.
  NavigationWidget* stack() const { return _root; }
  /// Does nothing when there is no page.
  void closePage();
  /// The content of the page; null when there is none.
  QWidget* page() const { return _page ? &_page->content() : nullptr; }
  /// Puts a bar below the stack, in place of an earlier one; null removes it.
  void setBar(std::unique_ptr<QWidget> bar);
  QWidget* bar() const { return _bar.get(); }
  /// The names from below the root to the current row of the top pane; without such a row, to the pane's own
  /// node.
  std::vector<std::string> pathOfFocus() const;

  /// The observer is called when the window is removed from the screen. It gets the size that the window has
  /// when it is neither maximized nor full-screen.
  void setLeavingObserver(std::function<void(const QSize&)> observer) {
    _leavingObserver = std::move(observer);
  }
  /// Gives the keyboard focus to what is on top.
  void takeKeyboard();

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void closeEvent(QCloseEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  void dropRoot();
  void arrange();

  QSize ordinarySize() const;

  Wishes _wishes;
  std::map<const QAction*, std::function<bool()>> _conditions;
  std::function<void(const QSize&)> _leavingObserver;
  QPointer<NavigationWidget> _root;
  PageWidget* _page = nullptr;  // a child
  std::unique_ptr<QWidget> _bar;
};

}  // namespace varnel
