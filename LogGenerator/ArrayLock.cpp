#include "LogGenerator/ArrayLock.h"

#include <cstdint>
#include <mutex>
#include <system_error>

namespace varnel {

namespace {

struct Lock {
  std::recursive_mutex mutex;
  std::uint8_t counter = 0;
};

Lock& theLock() {
  static Lock lock;
  return lock;
}

}  // namespace

void ArrayLock::lockArray() {
  Lock& lock = theLock();
  try {
    lock.mutex.lock();
  } catch (const std::system_error&) {
    // The thread has locked more often than the mutex can count, so it keeps the lock forever.
  }
  ++lock.counter;
}

void ArrayLock::unlockArray() {
  Lock& lock = theLock();
  if (--lock.counter == 0) lock.mutex.unlock();
}

}  // namespace varnel
