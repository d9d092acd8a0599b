#pragma once

#include <QGuiApplication>
#include <QPointingDevice>
#include <QScroller>
#include <QStyleHints>
#include <QTest>
#include <QWidget>
#include <chrono>
#include <memory>

namespace varnel {

/// A finger on a view that touch scrolls. While there is such an object, no finger is taken for one that
/// rests, however slow the machine is.
class Finger final {
 public:
  explicit Finger(QWidget& viewport) : _viewport(viewport) { restAfter(std::chrono::hours(1)); }
  Finger(const Finger&) = delete;
  Finger& operator=(const Finger&) = delete;
  ~Finger() { QGuiApplication::styleHints()->setMousePressAndHoldInterval(-1); }

  /// From now on, a finger rests after this time.
  static void restAfter(std::chrono::milliseconds time) {
    QGuiApplication::styleHints()->setMousePressAndHoldInterval(static_cast<int>(time.count()));
  }
  // No timer runs out within these three.
  void press(const QPoint& place) { touch().press(0, place, &_viewport).commit(false); }
  void move(const QPoint& place) { touch().move(0, place, &_viewport).commit(false); }
  void release(const QPoint& place) { touch().release(0, place, &_viewport).commit(false); }
  void tap(const QPoint& place) {
    press(place);
    release(place);
  }
  /// In ten steps.
  void drag(const QPoint& from, const QPoint& to) {
    press(from);
    for (int step = 1; step <= 10; ++step) {
      QTest::qWait(10);
      move(from + (to - from) * step / 10);
    }
    release(to);
  }
  /// Until what the finger has set in motion has come to rest: a tap would only stop it. False when it does
  /// not rest in time.
  bool waitForRest() {
    return QTest::qWaitFor([this] { return QScroller::scroller(&_viewport)->state() == QScroller::Inactive; },
                           60'000);
  }

 private:
  QTest::QTouchEventWidgetSequence touch() { return QTest::touchEvent(&_viewport, _device.get(), false); }

  QWidget& _viewport;
  const std::unique_ptr<QPointingDevice> _device{QTest::createTouchDevice()};
};

}  // namespace varnel
