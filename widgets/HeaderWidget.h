#pragma once

#include <QLabel>
#include <QWidget>
#include <functional>

#include "widgets/TextButton.h"

namespace varnel {

/// The bar above a pane: its title in the middle, and on the left the way back, named after the pane that it
/// leads to. Where both do not fit, the title's letters get smaller, then the way back is the arrowhead
/// alone, then the title is cut at its end and stands whole in its tooltip.
class HeaderWidget final : public QWidget {
 public:
  explicit HeaderWidget(QWidget* parent = nullptr);

  void setTitle(const QString& title);
  /// Whole, also where there is no room for all of it.
  QString title() const { return _wholeTitle; }
  /// Shows the way back to the pane of that title.
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
