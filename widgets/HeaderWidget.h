#pragma once

#include <QLabel>
#include <QWidget>
#include <functional>

#include "widgets/TextButton.h"

namespace varnel {

/// The bar above a pane. Its title is in the middle. The back button on the left has the title of the pane to
/// which it leads. When both do not fit, first the title gets smaller letters, then the back button loses its
/// text, then the title is cut at its end. Its tooltip then shows all of it.
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

  QSize sizeHint() const override;

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void paintEvent(QPaintEvent* event) override;

 private:
  enum class BackButton { Hidden, Mark, Whole };

  void arrange();
  bool arrangeWith(BackButton backButton, double titleSize);
  void showAsMuchAsFits(const QFont& font);
  QRect titleRoom(int backWidth, int titleWidth) const;

  TextButton _back;
  QLabel _title;
  QString _wholeTitle;
  std::function<void()> _backAction;
  bool _leadsBack = false;
};

}  // namespace varnel
