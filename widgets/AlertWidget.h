#pragma once

#include <QWidget>
#include <functional>

#include "platform/ui/UserInterface.h"
#include "widgets/TextButton.h"

namespace varnel {

/// A message above everything else in the window. It stays until the user closes it with its button, Return,
/// Space, or Escape. It keeps the keyboard focus meanwhile, and deletes itself afterwards.
class AlertWidget final : public QWidget {
 public:
  /// Calls `closed` when the user has closed it.
  AlertWidget(const Alert& alert, QWidget& window, std::function<void()> closed);

  TextButton& button() { return *_button; }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  bool focusNextPrevChild(bool next) override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void close();
  bool isOnTop() const;
  void keepKeyboard(const QWidget* holder);

  QWidget* _card;
  TextButton* _button;
  std::function<void()> _closed;
};

}  // namespace varnel
