#pragma once

#include <QPointer>
#include <QWidget>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ui/NavigationStack.h"
#include "widgets/ModalScreenWidget.h"
#include "widgets/PaneWidget.h"
#include "widgets/SlideOverlay.h"

namespace varnel {

/// Panes on top of each other. Every change happens at once; an animation is a picture above it.
///
/// A wide stack shows its last two panes side by side, the top one on the right. Controllers learn nothing of
/// that: a pane beside the top one is still one that has disappeared. When the user chooses one of its rows,
/// the stack first goes back to it.
///
/// Escape, Left, Backspace, and the desktop's key and mouse button for going back go back. While there are
/// two panes, Left and Right lead from one to the other. Ctrl+S presses the Save button of the top pane.
class NavigationWidget final : public QWidget, public NavigationStack {
 public:
  explicit NavigationWidget(std::shared_ptr<PaneController> root);
  ~NavigationWidget() override;

  void setDelegate(NavigationStackDelegate* delegate) override { _delegate = delegate; }
  std::vector<std::shared_ptr<PaneController>> controllers() const override { return _controllers; }
  std::shared_ptr<PaneController> topController() const override { return _controllers.back(); }
  void push(std::shared_ptr<PaneController> controller, Animation animation) override;
  void popTo(const PaneController& controller, Animation animation) override;
  void showToolbar() override;
  void setNotice(std::string_view text) override;
  const std::string& noticeText() const { return _notice; }
  /// The observer is called when the notice has changed.
  void setNoticeObserver(std::function<void()> observer) { _noticeObserver = std::move(observer); }
  void present(std::shared_ptr<ModalController> controller, Animation animation) override;
  void dismiss(Animation animation) override;

  /// The window becomes visible, and the top pane appears. The delegate is not told.
  void appear();
  /// Gives the keyboard focus to what is on top.
  void takeKeyboard();
  PaneWidget& topPane() const;
  using Path = std::vector<std::string>;
  /// What the stack asks for the records of lists, by the names from below the root to the list.
  struct RecordSource {
    std::function<bool(const Path& path)> hasRecords;                    ///< whether its rows are records
    std::function<std::optional<RecordList>(const Path& path)> records;  ///< nothing when there is no list
  };
  /// Holds for the panes that are on the stack and for those that come. Without it they show rows only.
  void setRecordSource(const RecordSource& source);
  /// Shows the list of the pane with the keyboard, else of the top pane, as a table with columns, or as rows
  /// again. False when neither is a list of records.
  bool toggleRecordTable();
  /// Whether `toggleRecordTable` would do something now.
  bool offersRecordTable() const;
  /// The pane on the left of the top one; null while there is none.
  PaneWidget* paneBeside() const;
  /// The names from below the root to the current row of the pane with the keyboard focus; without such a
  /// row, to the pane's own node. When no pane has the focus, the top one counts.
  std::vector<std::string> pathOfFocus() const;
  /// Whether `pathOfFocus` leads to a row.
  bool hasRowWithFocus() const;
  /// Null while no screen is presented.
  ModalScreenWidget* modalScreen() const;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;

 private:
  void adopt(std::size_t index);
  void release(PaneController& controller);
  void changeTop(std::vector<std::shared_ptr<PaneController>> controllers, Animation animation,
                 SlideOverlay::Movement movement);
  void arrange();
  void make(std::size_t index, const TableWidget::Choice& choice);
  void showWayBack(std::size_t index);
  void offerRecords(std::size_t index);
  void goBack();
  void goBackFrom(std::size_t index);
  bool showRowsAgain(const QKeyEvent& event);
  std::size_t paneWithKeyboard() const;
  void showPaneWithKeyboard();
  bool moveKeyboard(const QKeyEvent& event);
  PaneWidget& paneAt(std::size_t index) const;
  std::vector<std::string> pathOf(std::size_t index) const;
  void endAnimation();
  void slide(const QPixmap& former, const QRect& part, SlideOverlay::Movement movement);
  void releaseLater(std::shared_ptr<void> leaving);

  std::vector<std::shared_ptr<PaneController>> _controllers;
  std::shared_ptr<ModalController> _modal;
  NavigationStackDelegate* _delegate = nullptr;
  RecordSource _recordSource;
  bool _showsToolbar = false;
  bool _isChoosing = false;  // the places of the panes stay as they are until the choice is made
  std::string _notice;
  std::function<void()> _noticeObserver;
  QPointer<SlideOverlay> _overlay;
};

}  // namespace varnel
