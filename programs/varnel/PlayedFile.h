#pragma once

#include <QEventLoop>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/ChildServer.h"
#include "host/ControlClient.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/SavedDisplays.h"

namespace varnel {

/// What a server needs to play this capture as that of this technology, and of the SIM card that the options
/// name.
std::vector<std::string> argumentsForReplay(const Options& options, const std::string& capture,
                                            const std::optional<std::string>& technology);

/// The time of the first message of a capture, of whatever SIM card. Absent when there is none, and for what
/// is no regular file: reading would take its messages away.
std::optional<Time> firstTimeOf(const std::string& capture);

/// The file that the command line names, for a viewer that shows nothing else: the displays of a snapshot, or
/// a capture that is played by a server of the viewer's own. The clock of the models follows the capture.
class PlayedFile final {
 public:
  /// Without a file in the options does nothing. For a capture runs the event loop until models can connect
  /// to the server, or until the program is asked to end. The services must outlive the object. Throws
  /// std::runtime_error with the reason when the file cannot be shown.
  PlayedFile(const Options& options, HostServices& services);
  PlayedFile(const PlayedFile&) = delete;
  PlayedFile& operator=(const PlayedFile&) = delete;

  /// The displays of a snapshot, the oldest first; empty when the file is none.
  const std::vector<Generation>& displays() const { return _displays; }
  /// A new model gets the capture from its start. Call this before it connects.
  void startOver();

 private:
  void serverHasEnded(const std::string& file, const std::string& why);

  void play(const Options& options);
  void followPlaying();
  void take(const std::optional<ControlReply>& reply);

  HostServices& _services;
  std::vector<Generation> _displays;
  QEventLoop _start;
  std::string _trouble;  // why the server has ended before it was ready
  std::unique_ptr<ChildServer> _server;
  std::optional<Time> _firstTime;  // of the capture, if it is known
  std::unique_ptr<ControlClient> _control;
  std::unique_ptr<RepeatingTimer> _polling;  // absent at the end of the capture
};

}  // namespace varnel
