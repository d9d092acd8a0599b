#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>

#include "LogGenerator/MessageFate.h"
#include "host/captures/CaptureRecord.h"
#include "programs/varnel-decode/Subscriptions.h"

namespace varnel {

/// Counts messages by their log code and by what becomes of them. Each message is counted once.
class MessageStatistics {
 public:
  void add(const MessageFate& fate);
  /// What the capture held beside these messages.
  void setCapture(const Subscriptions::Counts& records, const LeftOut& leftOut);

  /// A line for each log code, in their order, then those of messages without one, then the sums. Where
  /// frames of the capture were left out, the sum of all frames follows, and a line for the records and each
  /// kind that was left out; where records name a SIM card, a line for each.
  std::string asTable() const;
  /// The same as one line of JSON: {"Messages": […], "Frames": {…}, "SIM": […], "Total": {…}}. With a
  /// capture's name it comes first, as "Capture".
  std::string asJson(const std::optional<std::string>& captureName) const;

 private:
  struct Counts {
    std::uint64_t received = 0, decoded = 0, tooShort = 0, tooLong = 0, unknown = 0;

    void add(MessageFate::Outcome outcome);
  };

  // A log code; for messages without one, which follow, what becomes of them.
  struct Kind {
    bool hasNoLogCode;
    std::uint32_t number;

    // NOLINTNEXTLINE(modernize-use-nullptr): the 0 that it sees is the compiler's own
    friend auto operator<=>(const Kind&, const Kind&) = default;
    std::string name() const;
  };

  static std::string tableLine(const std::string& name, const Counts& counts);
  static std::string jsonMembers(const Counts& counts);
  std::uint64_t recordCount() const;
  std::string frameLines() const;
  std::string subscriptionLines() const;
  std::string framesAsJson() const;
  std::string subscriptionsAsJson() const;

  std::map<Kind, Counts> _counts;
  Counts _total;
  Subscriptions::Counts _records;
  LeftOut _leftOut;
};

}  // namespace varnel
