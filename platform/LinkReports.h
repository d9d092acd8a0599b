#pragma once

#include <cstdint>
#include <string>

namespace varnel {

/// What the host knows of the link to the telephony service that a user should be told.
struct LinkReport {
  /// One sentence: why the last attempt to connect failed, where it looked, and what to type. Empty after one
  /// that went well, and before the first.
  std::string trouble;
  /// Where viewer and server meet, by the name that users have for it. Empty when there is no such name.
  std::string place;
  /// One sentence that the server said last about where its messages come from, as that a replay has ended.
  /// Empty when it said none since the link was opened.
  std::string serverNote;
  /// Messages since the link was opened that the server could not pass on because this viewer read too
  /// slowly.
  std::uint64_t droppedByServer = 0;
  /// Messages since the link was opened that are longer than the channel takes.
  std::uint64_t tooLongForChannel = 0;
};

/// Tells how the link does. Whoever shows it asks again whenever something may have changed.
class LinkReports {
 public:
  virtual ~LinkReports() = default;
  virtual LinkReport linkReport() const = 0;
};

}  // namespace varnel
