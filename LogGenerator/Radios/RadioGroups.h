#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/LogMessage.h"
#include "LogGenerator/Radios/RadioIndexes.h"
#include "LogGenerator/Services.h"
#include "LogGenerator/WriteTimes.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

/// The decoders of all radios for one subscription, and the groups of sections that they fill. A group is an
/// entry of the template whose value is a dictionary of sections; its decoders are those of its indexes,
/// found by the names of the sections. The CDMA2000 group is the display of a generator of its own.
class RadioGroups final : public WriteTimes {
 public:
  /// The template must outlive it. Without one, nothing is decoded.
  RadioGroups(const Services& services, const Value& displayTemplate);
  RadioGroups(const RadioGroups&) = delete;
  RadioGroups& operator=(const RadioGroups&) = delete;

  /// Binds the decoders to the groups in a dictionary, which keeps them from one generator to the next.
  /// Groups and sections that it lacks are copied from the template. A group that has said something is shown
  /// in the display, from now on or from the message on that says it.
  void bind(const Value& memory, const Value& display);

  /// Decodes one message. Returns whether a decoder knows its log code, version, and length.
  bool take(const LogMessage& message, ByteView bytes);
  MessageFate fateOf(const LogMessage& message, ByteView bytes) const;
  /// A display is about to be made.
  void prepareDisplay(const Time& now);
  /// When the last message came that a decoder takes; absent before the first.
  std::optional<Time> lastTaken() const { return _lastTaken; }

  /// All codes of the bound sections, the groups in the template's order.
  std::vector<std::uint32_t> logCodes() const;
  std::vector<CodeSections> codeSections() const;
  NumberFormats numberFormats() const;
  std::optional<Time> writtenAt(const Dictionary& entries, std::string_view key) const override;
  std::optional<Time> refilledAt(const Array& list) const override;

 private:
  struct Group {
    std::string key;  // as in the template: "1;LTE"
    const Dictionary* sections;
    std::vector<Base*> decoders;  // one per section; null where there is none
    Value shown{};
    bool isBound = false;  // from the first message on, or from an earlier generator's groups on
    bool isShown = false;
  };
  // A decoder that takes a log code, and its group.
  struct Delivery {
    std::size_t group;
    Subscriber subscriber;
    const MessageSection* messages;  // the decoder, if it is one of messages
  };
  // Who takes a log code.
  struct Takers {
    std::vector<Delivery> deliveries;
    bool isC2K = false;  // the CDMA2000 generator takes it too
  };

  void addGroup(const std::string& key, const Value& sections);
  std::vector<ClassIndex*> indexesOf(std::string_view group) const;
  Takers& takersOf(std::uint32_t logCode);
  void bindSections(Group& group);
  void noteWhetherShown(Group& group);
  void takeC2K(ByteView bytes);

  const Services _services;
  MessageFeed _messages;
  CellMonitorReader _cellMonitor;
  modem::ReportReader _modemReports;
  radios::Shared _shared;
  std::vector<std::unique_ptr<ClassIndex>> _indexes;
  C2KLogGenerator _c2k;
  std::vector<Group> _groups;
  std::vector<std::uint32_t> _codes;
  std::unordered_map<std::uint32_t, Takers> _takers;
  std::unordered_map<const void*, const Section*> _sections;  // by container
  Value _display, _c2kState;
  std::optional<Time> _lastTaken;
};

}  // namespace varnel
