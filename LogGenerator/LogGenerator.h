#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "LogGenerator/CodeSections.h"
#include "LogGenerator/MessageFate.h"
#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Services.h"
#include "LogGenerator/WriteTimes.h"
#include "base/Bytes.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel {

/// Keys of the state dictionary. The model owns it, and it outlives the generators that fill it.
namespace stateKey {
inline constexpr std::string_view displayTemplate = "Template";
inline constexpr std::string_view lookup = "Lookup";
inline constexpr std::string_view display = "Display";
inline constexpr std::string_view extraInfo = "ExtraInfo";
inline constexpr std::string_view displayState = "DisplayState";
inline constexpr std::string_view history = "History";
}  // namespace stateKey

/// Turns the messages of one modem technology into a display dictionary.
class LogGenerator : public WriteTimes {
 public:
  /// Logs "Creating Log object: %p".
  explicit LogGenerator(const Services& services);
  LogGenerator(const LogGenerator&) = delete;
  LogGenerator& operator=(const LogGenerator&) = delete;

  /// A new generator for the technology that the telephony service names; null when there is no generator for
  /// it.
  static std::unique_ptr<LogGenerator> generatorFromTechnology(const Value& technology,
                                                               const Services& services);
  /// The technologies that have a generator.
  static std::vector<std::string_view> technologies();

  /// Takes one message and updates the state.
  virtual void updateState_withData(Dictionary& state, ByteView data) = 0;
  /// The display dictionary; absent when there is none yet. Adds a snapshot record to the history.
  virtual Value generateLogUsingState(Dictionary& state) = 0;
  /// The command that starts the stream.
  virtual Value getStartCommand() const = 0;
  /// The items to save: an array of dictionaries, each with a "Description".
  virtual Value getSaveContentsFromState(const Dictionary& state) const = 0;
  /// What becomes of a message. It does not decode the message; it is for counting. A generator without
  /// packets, like this base class, decodes all messages and has no log codes.
  virtual MessageFate fateOf(ByteView /*message*/) const { return {MessageFate::Outcome::Decoded}; }
  /// The formats of the display's numbers, for callers that want numbers without units. A generator without
  /// packets, like this base class, has none.
  virtual NumberFormats numberFormats() const { return {}; }
  /// The sections that the packets of each log code feed, in the order of the start command. A generator
  /// without packets, like this base class, has none.
  virtual std::vector<CodeSections> codeSections() const { return {}; }
  /// How many messages the binary log lacks because their interval was full. They were decoded like all
  /// others. Always 0 without a binary log, as in this base class.
  virtual std::uint64_t messagesLeftOutOfLog() const { return 0; }
  /// Keeps no raw bytes from now on, for callers that save nothing. The records of the history then hold
  /// empty data. Does nothing without a binary log, as in this base class.
  virtual void keepNoRawBytes() {}
  /// How many messages were not decoded.
  std::uint64_t messagesNotDecoded() const { return _messagesNotDecoded; }

  /// The template file, when it could not be loaded and so there is no display; absent otherwise.
  virtual std::optional<std::string> missingTemplate() const { return std::nullopt; }
  /// False when an earlier generator made the state's display, so that no message changes it any more.
  virtual bool changesDisplayOf(const Dictionary& /*state*/) const { return true; }

 protected:
  /// Appends a snapshot record to the state's "History", which keeps the last five.
  void updateHistoryInState(Dictionary& state) const;
  const Services& services() const { return _services; }
  void countMessageNotDecoded() { ++_messagesNotDecoded; }

 private:
  const Services _services;
  std::uint64_t _messagesNotDecoded = 0;
};

}  // namespace varnel
