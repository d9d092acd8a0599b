#pragma once

#include <QApplication>
#include <memory>

#include "widgets/DesktopColours.h"

namespace varnel {

/// The event loop of a program with windows. Numbers keep the form that they have in C, whatever the user's
/// locale. The program goes on when its last window is closed.
class WidgetApplication final {
 public:
  /// The arguments are those of main and must outlive the object. Throws std::runtime_error when there is no
  /// display. When the display that is there cannot be used, the program ends with one line on standard error
  /// and exit status 1: the toolkit leaves no other way.
  WidgetApplication(int& argumentCount, char** arguments);

  /// Runs the event loop until `end` is called; returns the exit status given there.
  int run();
  /// Has the event loop return as soon as it has the turn.
  void end(int exitStatus);

 private:
  std::unique_ptr<QApplication> _application;
  std::unique_ptr<DesktopColours> _colours;  // null without a session bus
};

}  // namespace varnel
