#pragma once

#include <QObject>

#include "platform/MainQueue.h"

namespace varnel {

/// The main queue on the event loop of the program's QCoreApplication. An exception that leaves a task ends
/// the program. Tasks that have not run when the queue is destroyed never do. Delays and intervals of more
/// than 24.8 days, which the toolkit's timer cannot hold, are as long as that.
class EventLoopQueue final : public MainQueue {
 public:
  void async(Task task) override;
  void after(std::chrono::milliseconds delay, Task task) override;
  std::unique_ptr<RepeatingTimer> repeating(std::chrono::milliseconds interval, Task task) override;

 private:
  QObject _context;  // to whom the waiting tasks belong
};

}  // namespace varnel
