#pragma once

#include <memory>
#include <string>

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLVLogGenerator.h"

namespace varnel {

/// The generator with a template. Its display is a copy of a template resource. The class index has a decoder
/// for each section of the copy, by the section's name. Each packet goes to the decoders that have subscribed
/// to its log code. Packets are those of `LogMessage`, with either log type.
class KLVLogGenerator2 : public KLVLogGenerator {
 public:
  void updateState_withData(Dictionary& state, ByteView data) override;
  Value generateLogUsingState(Dictionary& state) override;
  Value getStartCommand() const override;
  MessageFate fateOf(ByteView message) const override;
  NumberFormats numberFormats() const override;
  std::optional<std::string> missingTemplate() const override;
  bool changesDisplayOf(const Dictionary& state) const override;
  std::vector<CodeSections> codeSections() const override;
  std::optional<Time> writtenAt(const Dictionary& entries, std::string_view key) const override;
  std::optional<Time> refilledAt(const Array& list) const override;

 protected:
  /// Takes ownership of both. A generator without a template resource has neither, and decodes nothing.
  KLVLogGenerator2(const Services& services, std::string pListName, std::shared_ptr<ClassIndex> classIndex);
  ~KLVLogGenerator2() override;

 private:
  /// Frames a message that the model's `updateWithData` passed on, and gives the packet to its decoders'
  /// `updateWithData_logCode` or handlers.
  void updateWithData(ByteView data);
  /// The display in the state. Kept: the call that builds it returns nothing; only later calls return it.
  Value getDisplayFromState(Dictionary& state);
  /// A copy of a template whose sections belong to their decoders.
  Value processTemplate(const Value& object);
  /// Reports values in a display that are neither strings nor containers. Kept: it prints nothing.
  static void printDict(const Value& object);

  std::string pListName;
  std::shared_ptr<ClassIndex> cIndex;
  bool _lacksTemplate = false;
  bool _hasBuiltDisplay = false;
};

}  // namespace varnel
