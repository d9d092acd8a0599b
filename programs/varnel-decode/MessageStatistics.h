#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "LogGenerator/MessageFate.h"
#include "LogGenerator/PacketVersion.h"
#include "host/captures/CaptureRecord.h"
#include "programs/varnel-decode/Subscriptions.h"

namespace varnel {

/// Counts messages by log code and by what becomes of them. Each message is counted once.
class MessageStatistics {
 public:
  void add(const MessageFate& fate);
  /// What else the capture held besides these messages.
  void setCapture(const Subscriptions::Counts& records, const LeftOut& leftOut);

  /// One line per log code in ascending order, then the lines of messages without one, then the sums. One
  /// line per unknown version follows the line of its log code. If frames of the capture were left out, then
  /// come the sum of all frames, one line for the records, and one per kind of left-out frame. If records
  /// name a SIM card, one line per SIM card ends the table.
  std::string asTable() const;
  /// The same as one line of JSON: {"Messages": […], "Frames": {…}, "SIM": […], "Total": {…}}. With a
  /// capture's name, "Capture" comes first.
  std::string asJson(const std::optional<std::string>& captureName) const;
  /// What a report of many captures says of one: "Records":…,"Left Out":{…},"Unknown Versions":[{"Name":…,
  /// "Version":…,"Messages":…},…].
  std::string asReportMembers() const;

  /// A line of the table for other writers.
  struct Row {
    std::string name;
    /// Received, decoded, too short, too long, unknown, of an unknown version.
    std::array<std::uint64_t, 6> counts{};
    std::vector<std::pair<std::string, std::uint64_t>> unknownVersions{};
  };
  /// The lines without the sums.
  std::vector<Row> rows() const;
  /// What was left out, by kind; 0 where there is none.
  std::vector<std::pair<std::string, std::uint64_t>> leftOut() const;
  /// The number of records, decoded or not.
  std::uint64_t recordCount() const;

 private:
  struct Counts {
    std::uint64_t received = 0, decoded = 0, tooShort = 0, tooLong = 0, unknown = 0, unknownVersion = 0;

    void add(MessageFate::Outcome outcome);
  };

  // How many messages have each unknown version of a log code.
  struct UnknownVersions {
    std::map<PacketVersion, std::uint64_t> counts;
    std::uint64_t others = 0;  // of the versions that found no room in `counts`

    void add(const PacketVersion& version);
  };

  // A log code. For messages without a log code, which come after the others, what becomes of them.
  struct Kind {
    bool hasNoLogCode;
    std::uint32_t number;

    // NOLINTNEXTLINE(modernize-use-nullptr): the 0 that it sees is the compiler's own
    friend auto operator<=>(const Kind&, const Kind&) = default;
    std::string name() const;
  };

  static std::string tableLine(const std::string& name, const Counts& counts);
  static std::string jsonMembers(const Counts& counts);
  std::string versionLines(const Kind& kind) const;
  std::string versionsAsJson(const Kind& kind) const;
  std::string frameLines() const;
  std::string subscriptionLines() const;
  std::string framesAsJson() const;
  std::string subscriptionsAsJson() const;

  std::map<Kind, Counts> _counts;
  std::map<Kind, UnknownVersions> _versions;
  Counts _total;
  Subscriptions::Counts _records;
  LeftOut _leftOut;
};

}  // namespace varnel
