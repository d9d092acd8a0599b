#pragma once

#include <QLabel>
#include <QWidget>
#include <functional>
#include <optional>

#include "widgets/GlyphButton.h"
#include "widgets/TextButton.h"

namespace varnel {

/// The bar above a pane. Its title is in the middle. The back button on the left has the title of the pane to
/// which it leads. On the right there may be a button for another way to show the pane, and one for the menu.
/// When all do not fit, first the title gets smaller letters, then the back button loses its text, then the
/// title is cut at its end. Its tooltip then shows all of it.
class HeaderWidget final : public QWidget {
 public:
  explicit HeaderWidget(QWidget* parent = nullptr);

  void setTitle(const QString& title);
  /// The whole title, even when there is no room for all of it.
  QString title() const { return _wholeTitle; }
  /// Shows the back button, which leads to the pane with this title.
  void showBackButton(const QString& parentTitle);
  /// Called when the user wants to go back.
  void setBackAction(std::function<void()> action) { _backAction = std::move(action); }

  /// A button on the right.
  struct SideButton {
    QString text;
    QString tooltip;
  };
  /// Nothing removes the button.
  void showSideButton(const std::optional<SideButton>& button);
  /// Called when the user presses the button on the right.
  void setSideAction(std::function<void()> action) { _sideAction = std::move(action); }

  /// A button at the right end, which asks for the menu of the window as a finger that rests does.
  void showMenuButton(bool isShown);

  QSize sizeHint() const override;

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void paintEvent(QPaintEvent* event) override;

 private:
  enum class BackButton { Hidden, Mark, Whole };

  void askForMenu();
  void arrange();
  bool arrangeWith(BackButton backButton, double titleSize);
  void showAsMuchAsFits(const QFont& font);
  QRect titleRoom(int backWidth, int titleWidth) const;
  int rightInset() const;

  TextButton _back;
  QLabel _title;
  QString _wholeTitle;
  TextButton _side;
  GlyphButton _menu;
  std::function<void()> _backAction;
  std::function<void()> _sideAction;
  bool _leadsBack = false;
  bool _hasSideButton = false;
  bool _hasMenuButton = false;
};

}  // namespace varnel
