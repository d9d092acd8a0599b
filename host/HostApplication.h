#pragma once

#include <QCoreApplication>

namespace varnel {

/// The program's event loop. Numbers keep their form in C, in every locale.
class HostApplication final {
 public:
  /// The arguments of main, which must outlive the object.
  HostApplication(int& argumentCount, char** arguments);

  /// Runs the event loop until `end` is called; returns the exit status given there.
  int run();
  /// Makes the event loop return as soon as it gets control.
  void end(int exitStatus);

 private:
  QCoreApplication _application;
};

}  // namespace varnel
