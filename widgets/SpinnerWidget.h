#pragma once

#include <QBasicTimer>
#include <QWidget>
#include <chrono>

namespace varnel {

/// A small gray wheel that turns while it is on: one turn per second for three seconds, then one picture per
/// second. It is hidden while it is off.
class SpinnerWidget final : public QWidget {
 public:
  explicit SpinnerWidget(QWidget* parent = nullptr);
  void setAnimating(bool isAnimating);
  QSize sizeHint() const override;
  /// How long each picture is shown.
  std::chrono::milliseconds timeOfPicture() const;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void timerEvent(QTimerEvent* event) override;
  void showEvent(QShowEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  void turn();

  QBasicTimer _timer;
  int _step = 0;  // since the wheel was shown
};

}  // namespace varnel
