#pragma once

#include <QObject>

#include "platform/MainQueue.h"

namespace varnel {

/// The main queue on the event loop of the program's QCoreApplication. An exception that leaves a task ends
/// the program. When the queue is destroyed, tasks that have not run never run. Delays and intervals longer
/// than 24.8 days, which the toolkit's timer cannot hold, become 24.8 days.
class EventLoopQueue final : public MainQueue {
 public:
  void async(Task task) override;
  void after(std::chrono::milliseconds delay, Task task) override;
  std::unique_ptr<RepeatingTimer> repeating(std::chrono::milliseconds interval, Task task) override;

 private:
  QObject _context;  // owner of the waiting tasks
};

}  // namespace varnel
