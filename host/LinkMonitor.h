#pragma once

#include <cstdint>
#include <filesystem>
#include <string>

#include "base/Bytes.h"
#include "platform/LinkReports.h"

namespace varnel {

/// Gathers what the ports and the telephony service of a runtime folder learn of the link.
class LinkMonitor final : public LinkReports {
 public:
  explicit LinkMonitor(std::filesystem::path runtimeFolder) : _folder(std::move(runtimeFolder)) {}

  LinkReport linkReport() const override;

  /// Another process has the name of this viewer's port.
  void portNameIsTaken();
  /// A port or a connection could not be made for that reason, one sentence.
  void failed(std::string_view reason);
  /// The server could not be connected to; the error is the system's, EPERM for a server that is not trusted.
  void serverIsOutOfReach(int systemError);
  /// The server refused a log channel, or did not answer, with that error of the protocol.
  void channelWasRefused(std::int64_t error);
  /// The server did not answer a command.
  void commandWentUnanswered();
  /// The server takes commands. What was told of an earlier link is forgotten.
  void linkIsOpen() { _report = {}; }
  /// The server tells about its stream; what is no report is passed over.
  void takeStreamReport(ByteView bytes);

 private:
  void tell(std::string_view what, std::string_view whatToDo);

  const std::filesystem::path _folder;
  LinkReport _report;
};

}  // namespace varnel
