#pragma once

#include "LogGenerator/LogGenerator.h"

namespace varnel {

/// The generator of GSM modems whose telephony server sends objects, not packets: each message is one
/// property list of strings, dictionaries and arrays, the whole picture at that moment. "DisplayState" is the
/// object as received, "Display" what `processObject` makes of it.
class GSMLogGenerator final : public LogGenerator {
 public:
  using LogGenerator::LogGenerator;
  static std::unique_ptr<LogGenerator> generator(const Services& services);

  /// Raises AssertionFailure for a message that is no property list or holds anything but strings,
  /// dictionaries and arrays. The state is then as it was.
  void updateState_withData(Dictionary& state, ByteView data) override;
  Value generateLogUsingState(Dictionary& state) override;
  Value getStartCommand() const override;
  /// The whole picture is as old as its message.
  std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view /*key*/) const override {
    return _received;
  }
  /// The records of the history.
  Value getSaveContentsFromState(const Dictionary& state) const override;

  /// The display form of an object, in containers of its own: each array without its first element, and each
  /// dictionary of one entry that is a child replaced by the value of that entry. Raises AssertionFailure for
  /// any kind of value but strings, dictionaries and arrays.
  static Value processObject(const Value& object);
  /// The value of a dictionary's only entry; absent for anything else.
  static Value canCollapse(const Value& object);

 private:
  std::optional<Time> _received;
};

}  // namespace varnel
