#pragma once

#include <QCoreApplication>

namespace varnel {

/// The program's event loop. Numbers keep the form that they have in C, whatever the user's locale.
class HostApplication final {
 public:
  /// The arguments are those of main and must outlive the object.
  HostApplication(int& argumentCount, char** arguments);

  /// Runs the event loop until `end` is called; returns the exit status given there.
  int run();
  /// Has the event loop return as soon as it has the turn.
  void end(int exitStatus);

 private:
  QCoreApplication _application;
};

}  // namespace varnel
