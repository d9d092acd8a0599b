#pragma once

namespace varnel {

/// The one lock around every walk over an array of the display and every emptying or refilling of one.
///
/// Kept: the lock is recursive but is released only when the nesting counter (8 bits, wrapping) is back at 0,
/// and then once. A thread that nests its locking therefore keeps the lock. Everybody runs on the main
/// thread, where this blocks nobody.
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
