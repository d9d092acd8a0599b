#include "programs/varnel/HostServices.h"

#include "base/PropertyList.h"
#include "host/Printable.h"
#include "host/RuntimeFolder.h"

namespace varnel {

HostServices::HostServices(const Options& options, const ApplicationInfo& application)
    : _log({.programName = programName, .standardErrorLevel = options.logLevel}),
      _folder(viewersFolder(options.runtimeFolder)),
      _systemsFolder(options.runtimeFolder ? std::nullopt
                                           : std::optional<std::filesystem::path>(systemsFolder)),
      _link(_folder.path),
      _server(_folder, _systemsFolder, _link),
      _portsOfSubscription(_server, _link, options.subscription),
      _resources(readableResourceFolder()),
      _deviceRoot(deviceRoot(options.deviceRoot)),
      _files(_deviceRoot.folder),
      _preferences(_deviceRoot.folder),
      _application(application),
      _identities(options.showsIdentities ? Identities::Shown : Identities::Hidden) {
  if (_deviceRoot.failure.empty()) return;
  std::cerr << programName << ": " << printable(_deviceRoot.failure)
            << "; name one that stands for a device with --device-root\n";
}

void HostServices::connectTo(const RuntimeFolder& server) {
  _link.setEndOfOwnServer({});
  _server.moveTo(server, std::nullopt);
}

void HostServices::connectToUsualServer() {
  _link.setEndOfOwnServer({});
  _server.moveTo(_folder, _systemsFolder);
}

ModelServices HostServices::model(std::ostream& standardOutput) {
  return {_portsOfSubscription,
          _server,
          _queue,
          {_resources, _playedClock, _application, standardOutput, _identities},
          writeXmlPropertyList,
          &_link};
}

}  // namespace varnel
