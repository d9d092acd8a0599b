#pragma once

#include <QEventLoop>
#include <memory>
#include <string>
#include <vector>

#include "host/ChildServer.h"
#include "programs/varnel/HostServices.h"

namespace varnel {

/// What a server needs to play this capture as the options say.
std::vector<std::string> argumentsForReplay(const Options& options, const std::string& capture);

/// The capture that the command line names, played by a server of the viewer's own, for a viewer that shows
/// nothing else.
class PlayedFile final {
 public:
  /// Without a file in the options does nothing. Else runs the event loop until models can connect to the
  /// server, or until the program is asked to end. The services must outlive the object. Throws
  /// std::runtime_error with the server's reason when the file cannot be played.
  PlayedFile(const Options& options, HostServices& services);
  PlayedFile(const PlayedFile&) = delete;
  PlayedFile& operator=(const PlayedFile&) = delete;

 private:
  void serverHasEnded(const std::string& file, const std::string& why);

  HostServices& _services;
  QEventLoop _start;
  std::string _trouble;  // why the server has ended before it was ready
  std::unique_ptr<ChildServer> _server;
};

}  // namespace varnel
