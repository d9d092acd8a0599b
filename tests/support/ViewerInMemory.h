#pragma once

#include <QCoreApplication>
#include <chrono>
#include <string>

#include "app/RowAnswers.h"
#include "app/ValueHistory.h"
#include "app/VarnelApp.h"
#include "base/PropertyList.h"
#include "host/FileResources.h"
#include "programs/varnel/RowCommands.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeDeviceFiles.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/FakeTelephony.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/RecordingPreferences.h"
#include "tests/support/TestServices.h"
#include "widgets/WidgetUserInterface.h"

namespace varnel {

/// The whole window viewer, with a modem and a time that the test controls. It needs a `QApplication`.
struct ViewerInMemory {
  explicit ViewerInMemory(const std::string& technology) {
    host.clock.set({1709294709, 0});
    files.existing.insert("/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
    ports.answer = [technology](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", technology}}))};
    };
    userInterface.setWindowObserver([this](WindowWidget& window) { commands.addTo(window); });
  }

  /// A message of the modem.
  void deliver(ByteView message) { ports.deliver("com.orvane.BasebandStateReport.LogChannel", 0, message); }
  /// Two seconds pass, and the window shows what has come.
  void refresh() {
    host.clock.set({host.clock.now().seconds + 2, 0});
    queue.advance(std::chrono::seconds(2));
    QCoreApplication::processEvents();
  }
  WindowWidget& window() { return static_cast<WindowWidget&>(*app.window()); }

  TestServices host;
  FileResources resources{resourceFolder()};
  const Services services{resources, host.clock, host.application, host.standardOutput};
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeDeviceFiles files;
  RecordingPreferences preferences;
  WidgetUserInterface userInterface{{}};
  ValueHistory history;
  const RowAnswers answers{resources, host.clock, history};
  VarnelApp app{{.model = {ports, telephony, queue, services, writeXmlPropertyList},
                 .files = files,
                 .preferences = preferences,
                 .userInterface = userInterface,
                 .history = &history}};
  RowCommands commands{app, answers};
};

}  // namespace varnel
