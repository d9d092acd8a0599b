#pragma once

#include <cstdint>
#include <string>

namespace varnel {

/// What the host knows about the link to the telephony service, and a user should know.
struct LinkReport {
  /// One sentence: why the last attempt to connect failed, where it looked, and what to type. Empty before
  /// the first attempt and after a successful one.
  std::string trouble;
  /// Where viewer and server meet, by the name that users know. Empty when there is no such name.
  std::string place;
  /// The server's last sentence about where its messages come from, for example that a replay has ended.
  /// Empty when it has sent none since the link was opened.
  std::string serverNote;
  /// One sentence: that messages of several SIM cards have arrived since the link was opened, that the
  /// display mixes them, and how to see one card. Empty when there are not several. The sentence is not true
  /// of a display that keeps the cards apart, as that of all radios does.
  std::string mixture;
  /// How many messages the server could not deliver since the link was opened, because this viewer reads too
  /// slowly.
  std::uint64_t droppedByServer = 0;
  /// How many messages since the link was opened are longer than the channel allows.
  std::uint64_t tooLongForChannel = 0;
};

/// Reports on the link. The caller asks again whenever something may have changed.
class LinkReports {
 public:
  virtual ~LinkReports() = default;
  virtual LinkReport linkReport() const = 0;
};

}  // namespace varnel
