#pragma once

#include <bitset>
#include <cstdint>
#include <filesystem>
#include <string>
#include <utility>

#include "base/Bytes.h"
#include "platform/LinkReports.h"

namespace varnel {

/// Collects what the ports and the telephony service of a runtime folder learn about the link.
class LinkMonitor final : public LinkReports {
 public:
  explicit LinkMonitor(std::filesystem::path runtimeFolder) : _folder(std::move(runtimeFolder)) {}

  LinkReport linkReport() const override;

  /// The viewer looks into this folder from now on. What keeps it from looking into another one is one
  /// sentence, or empty.
  void looksInto(std::filesystem::path runtimeFolder, std::string obstacle);
  /// The server that this process had started has ended. The sentence is told in place of why no server can
  /// be reached; an empty one ends that.
  void setEndOfOwnServer(std::string sentence) { _endOfOwnServer = std::move(sentence); }
  /// Another process has a port with the name of this viewer's port.
  void portNameIsTaken();
  /// A port or a connection could not be made. The reason is one sentence.
  void failed(std::string_view reason);
  /// The connection to the server failed. The error is the system's, or EPERM for a server that is not
  /// trusted.
  void serverIsOutOfReach(int systemError);
  /// The server refused a log channel with this error of the protocol, or did not answer.
  void channelWasRefused(std::int64_t error);
  /// The server did not answer a command.
  void commandWentUnanswered();
  /// The server takes commands. Forgets what was reported about an earlier link.
  void linkIsOpen();
  /// Nothing that has arrived is shown any more.
  void displayIsGone() { _shownSubscriptions.reset(); }
  /// A message of this SIM card's modem has arrived, and the viewer shows it.
  void subscriptionIsShown(std::uint8_t subscription) { _shownSubscriptions.set(subscription); }
  /// Takes the server's report about its stream. Ignores bytes that are no report.
  void takeStreamReport(ByteView bytes);

 private:
  void tell(std::string_view what, std::string_view whatToDo);
  std::string mixture() const;

  std::filesystem::path _folder;
  std::string _obstacle;
  std::string _endOfOwnServer;  // empty while it serves, and when there is none
  LinkReport _report;
  std::bitset<256> _shownSubscriptions;
};

}  // namespace varnel
