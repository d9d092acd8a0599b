#pragma once

#include <iostream>

#include "host/EventLoopQueue.h"
#include "host/FilePreferences.h"
#include "host/FileResources.h"
#include "host/HostLog.h"
#include "host/LinkMonitor.h"
#include "host/NearestServer.h"
#include "host/RootedFiles.h"
#include "host/SubscriptionPorts.h"
#include "host/SystemClock.h"
#include "model/VarnelModel.h"
#include "programs/varnel/DeviceRoot.h"
#include "programs/varnel/Options.h"
#include "programs/varnel/PlayedClock.h"

namespace varnel {

/// What every viewer needs from the host. It needs an event loop.
class HostServices final {
 public:
  /// The application information must outlive it. Throws std::runtime_error when the runtime folder cannot be
  /// used or the resources cannot be read.
  HostServices(const Options& options, const ApplicationInfo& application);

  /// Lines of generators for standard output go to this stream, which must outlive the models.
  ModelServices model(std::ostream& standardOutput = std::cout);
  /// Models connect to the server of this folder alone, from their next attempt on.
  void connectTo(const RuntimeFolder& server);
  /// Models connect to the server that the options name, from their next attempt on.
  void connectToUsualServer();
  LinkMonitor& link() { return _link; }
  MainQueue& queue() { return _queue; }
  DeviceFiles& files() { return _files; }
  /// The machine's clock.
  const Clock& clock() const { return _clock; }
  /// The clock of the models. It shows the machine's time until it follows a capture.
  PlayedClock& playedClock() { return _playedClock; }
  /// How many messages the models' channels have taken so far.
  std::uint64_t messagesTaken() const { return _portsOfSubscription.messagesTaken(); }
  Preferences& preferences() { return _preferences; }

 private:
  HostLog _log;
  const RuntimeFolder _folder;
  const std::optional<std::filesystem::path> _systemsFolder;  // absent when the user names a folder
  LinkMonitor _link;
  NearestServer _server;
  SubscriptionPorts _portsOfSubscription;  // of all subscriptions unless the user asked for one
  EventLoopQueue _queue;
  FileResources _resources;
  SystemClock _clock;
  PlayedClock _playedClock{_clock};
  const DeviceRoot _deviceRoot;
  RootedFiles _files;
  FilePreferences _preferences;
  const ApplicationInfo& _application;
  const Identities _identities;
};

}  // namespace varnel
