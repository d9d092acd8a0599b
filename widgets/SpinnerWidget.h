#pragma once

#include <QBasicTimer>
#include <QWidget>

namespace varnel {

/// A small grey wheel that turns while it is on; hidden while it is off.
class SpinnerWidget final : public QWidget {
 public:
  explicit SpinnerWidget(QWidget* parent = nullptr);
  void setAnimating(bool isAnimating);
  QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void timerEvent(QTimerEvent* event) override;
  void showEvent(QShowEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  QBasicTimer _timer;
  int _step = 0;
};

}  // namespace varnel
