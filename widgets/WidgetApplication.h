#pragma once

#include <QApplication>
#include <memory>

#include "widgets/DesktopSettings.h"

namespace varnel {

/// The event loop of a program with windows. Numbers keep their form in C, in every locale. The program goes
/// on when its last window is closed.
class WidgetApplication final {
 public:
  /// The arguments of main, which must outlive the object. Throws std::runtime_error when there is no
  /// display. If the toolkit cannot use the display, the program ends with one line on standard error and
  /// exit status 1: the toolkit allows nothing else.
  WidgetApplication(int& argumentCount, char** arguments);

  /// Runs the event loop until `end` is called; returns the exit status given there.
  int run();
  /// Makes the event loop return as soon as it gets control.
  void end(int exitStatus);

 private:
  std::unique_ptr<QApplication> _application;
  std::unique_ptr<DesktopSettings> _settings;  // null without a session bus
};

}  // namespace varnel
