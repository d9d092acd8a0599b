#pragma once

#include "base/WhileAlive.h"
#include "platform/MainQueue.h"

namespace varnel {

/// Repaints the screen once, after all that changes at the same time has changed.
class Repainting {
 public:
  Repainting(MainQueue& queue, std::function<void()> repaint) : _queue(queue), _repaint(std::move(repaint)) {}

  void want() {
    if (_isWanted) return;
    _isWanted = true;
    _queue.async(_whileAlive([this] {
      _isWanted = false;
      _repaint();
    }));
  }
  /// Keeps the object until the running task has returned: it may have been the object that asked to leave.
  void releaseLater(std::shared_ptr<void> leaving) {
    _queue.async([leaving = std::move(leaving)] {});
  }

 private:
  MainQueue& _queue;
  std::function<void()> _repaint;
  bool _isWanted = false;
  WhileAlive _whileAlive;
};

}  // namespace varnel
