#pragma once

#include "LogGenerator/LogGenerator.h"

namespace varnel {

/// The generator of GSM modems whose telephony server sends objects, not packets. Each message is one
/// property list of strings, dictionaries, and arrays: the whole picture of that moment. "DisplayState" is
/// the object as received. "Display" is the result of `processObject`.
class GSMLogGenerator final : public LogGenerator {
 public:
  using LogGenerator::LogGenerator;
  static std::unique_ptr<LogGenerator> generator(const Services& services);

  /// Raises AssertionFailure for a message that is no property list, or that holds anything but strings,
  /// dictionaries, and arrays. Then the state does not change.
  void updateState_withData(Dictionary& state, ByteView data) override;
  Value generateLogUsingState(Dictionary& state) override;
  Value getStartCommand() const override;
  /// The whole picture has the time of its message.
  std::optional<Time> writtenAt(const Dictionary& /*entries*/, std::string_view /*key*/) const override {
    return _received;
  }
  /// The records of the history.
  Value getSaveContentsFromState(const Dictionary& state) const override;

  /// The display form of an object, in new containers. Each array loses its first element. Each child
  /// dictionary with one entry is replaced by the value of that entry. Raises AssertionFailure for any value
  /// but strings, dictionaries, and arrays.
  static Value processObject(const Value& object);
  /// The value of a dictionary's only entry; absent for any other value.
  static Value canCollapse(const Value& object);

 private:
  std::optional<Time> _received;
};

}  // namespace varnel
