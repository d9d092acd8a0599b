#pragma once

namespace varnel {

/// The lock for every walk over an array of the display, and for every change of such an array.
///
/// Kept: the lock is recursive, but it is released only once, when the nesting counter (8 bits, wrapping) is
/// back at 0. So a thread that locks several times keeps the lock. Everything runs on the main thread, where
/// this blocks nobody.
class ArrayLock {
 public:
  static void lockArray();
  static void unlockArray();

  /// Holds the lock for the length of a scope.
  class Scope {
   public:
    Scope() { lockArray(); }
    ~Scope() { unlockArray(); }
    Scope(const Scope&) = delete;
    Scope& operator=(const Scope&) = delete;
  };
};

}  // namespace varnel
