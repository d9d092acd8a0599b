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

/// Keys of the state dictionary, which belongs to the model and outlives the generators that fill it.
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

  /// A new generator for the technology that the telephony service names; null for a technology that has
  /// none.
  static std::unique_ptr<LogGenerator> generatorFromTechnology(const Value& technology,
                                                               const Services& services);
  /// The names of the technologies that have a generator.
  static std::vector<std::string_view> technologies();

  /// Folds one incoming message into the state.
  virtual void updateState_withData(Dictionary& state, ByteView data) = 0;
  /// The display dictionary, or the absent value when there is none yet; records a snapshot in the history.
  virtual Value generateLogUsingState(Dictionary& state) = 0;
  /// The command that starts the stream.
  virtual Value getStartCommand() const = 0;
  /// The items to save: an array of dictionaries, each with a "Description".
  virtual Value getSaveContentsFromState(const Dictionary& state) const = 0;
  /// What becomes of a message, which is not decoded for that; for those who count messages. Without packets,
  /// as here, all are decoded and none has a log code.
  virtual MessageFate fateOf(ByteView /*message*/) const { return {MessageFate::Outcome::Decoded}; }
  /// How the display writes its numbers; for those who want them without their units. Without packets, as
  /// here, nothing is known of units.
  virtual NumberFormats numberFormats() const { return {}; }
  /// What the packets of each log code feed, in the order of the start command; for those who name packets.
  /// Without packets, as here, nothing.
  virtual std::vector<CodeSections> codeSections() const { return {}; }
  /// How many messages the binary log lacks because their interval had brought too much already. They were
  /// decoded like all others. Always 0 without a binary log, as here.
  virtual std::uint64_t messagesLeftOutOfLog() const { return 0; }
  /// Collects no raw bytes from now on, for those who save nothing: the records of the history hold empty
  /// data in their place. Nothing happens without a binary log, as here.
  virtual void keepNoRawBytes() {}
  /// How many of the messages folded in were of another fate than to be decoded.
  std::uint64_t messagesNotDecoded() const { return _messagesNotDecoded; }

  /// The resource file without which there is no display, when it could not be loaded; absent otherwise.
  virtual std::optional<std::string> missingTemplate() const { return std::nullopt; }
  /// False when the state's display was made by an earlier generator and no message changes it any more.
  virtual bool changesDisplayOf(const Dictionary& /*state*/) const { return true; }

 protected:
  /// Appends a snapshot record to the state's "History", which keeps the newest five.
  void updateHistoryInState(Dictionary& state) const;
  const Services& services() const { return _services; }
  void countMessageNotDecoded() { ++_messagesNotDecoded; }

 private:
  const Services _services;
  std::uint64_t _messagesNotDecoded = 0;
};

}  // namespace varnel
