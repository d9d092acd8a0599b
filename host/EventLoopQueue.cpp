#include "host/EventLoopQueue.h"

#include <QTimer>
#include <algorithm>
#include <limits>
#include <utility>

namespace varnel {

namespace {

// On some paths the event loop would go on after an exception, so no exception may reach it.
auto endingWithExceptions(MainQueue::Task task) {
  return [task = std::move(task)]() noexcept { task(); };
}

// The longest delay that the toolkit's timer can hold is 24.8 days.
std::chrono::milliseconds clamped(std::chrono::milliseconds delay) {
  constexpr std::chrono::milliseconds longest(std::numeric_limits<int>::max());
  return std::clamp(delay, std::chrono::milliseconds(0), longest);
}

class EventLoopTimer final : public RepeatingTimer {
 public:
  EventLoopTimer(std::chrono::milliseconds interval, MainQueue::Task task) {
    _timer.setTimerType(Qt::PreciseTimer);
    // The connection keeps the task alive while it runs, even when the task destroys the timer.
    _timer.callOnTimeout(&_timer, endingWithExceptions(std::move(task)));
    _timer.start(clamped(interval));
  }

 private:
  QTimer _timer;
};

}  // namespace

void EventLoopQueue::async(Task task) {
  QMetaObject::invokeMethod(&_context, endingWithExceptions(std::move(task)), Qt::QueuedConnection);
}

void EventLoopQueue::after(std::chrono::milliseconds delay, Task task) {
  QTimer::singleShot(clamped(delay), Qt::PreciseTimer, &_context, endingWithExceptions(std::move(task)));
}

std::unique_ptr<RepeatingTimer> EventLoopQueue::repeating(std::chrono::milliseconds interval, Task task) {
  return std::make_unique<EventLoopTimer>(interval, std::move(task));
}

}  // namespace varnel
