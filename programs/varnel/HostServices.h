#pragma once

#include <iostream>
#include <optional>

#include "host/EventLoopQueue.h"
#include "host/FilePreferences.h"
#include "host/FileResources.h"
#include "host/HostLog.h"
#include "host/LinkMonitor.h"
#include "host/RootedFiles.h"
#include "host/SocketPorts.h"
#include "host/SocketTelephonyService.h"
#include "host/SubscriptionPorts.h"
#include "host/SystemClock.h"
#include "model/VarnelModel.h"
#include "programs/varnel/Options.h"

namespace varnel {

/// What either way of showing the display needs of the host. It needs an event loop.
class HostServices final {
 public:
  /// The application information outlives it. Throws std::runtime_error when the runtime folder cannot be
  /// used or the resources cannot be read.
  HostServices(const Options& options, const ApplicationInfo& application);

  /// What generators have to say on standard output goes to that stream, which outlives the models.
  ModelServices model(std::ostream& standardOutput = std::cout);
  DeviceFiles& files() { return _files; }
  Preferences& preferences() { return _preferences; }

 private:
  // All of them, or those of the subscription that is asked for.
  MessagePorts& ports();

  HostLog _log;
  std::filesystem::path _folder;
  LinkMonitor _link;
  SocketPorts _ports;
  std::optional<SubscriptionPorts> _portsOfSubscription;  // where one is asked for
  SocketTelephonyService _telephony;
  EventLoopQueue _queue;
  FileResources _resources;
  SystemClock _clock;
  RootedFiles _files;
  FilePreferences _preferences;
  const ApplicationInfo& _application;
};

}  // namespace varnel
