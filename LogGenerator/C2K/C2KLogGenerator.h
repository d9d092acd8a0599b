#pragma once

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/State.h"
#include "LogGenerator/KLVLogGenerator.h"

namespace varnel {

/// The generator of CDMA2000 1x and EV-DO modems. The template "C2KTemplate" fixes the shape of the display.
/// Each of its texts names the display variable that is shown in its place. The packet decoders publish
/// variables. The lookup, made from the template, tells where they are shown.
class C2KLogGenerator final : public KLVLogGenerator {
 public:
  using KLVLogGenerator::KLVLogGenerator;
  static std::unique_ptr<LogGenerator> generator(const Services& services);

  void updateState_withData(Dictionary& state, ByteView data) override;
  Value generateLogUsingState(Dictionary& state) override;
  Value getStartCommand() const override;
  MessageFate fateOf(ByteView message) const override;
  NumberFormats numberFormats() const override;
  std::optional<std::string> missingTemplate() const override;
  bool changesDisplayOf(const Dictionary& state) const override;
  /// For each packet, the sections of the template that show a variable which the packet's decoder publishes.
  std::vector<CodeSections> codeSections() const override;
  std::optional<Time> writtenAt(const Dictionary& entries, std::string_view key) const override {
    return _lookup.writtenAt(entries, key);
  }

  /// Fills the display, a dictionary, with the shape of the template. Fills the lookup with an array per
  /// variable. The array has a placement {"key": the entry, "dict": the dictionary of the display with the
  /// entry} for each place that names the variable.
  static void processTemplate_storeDisplayIntoDict_storeLookupIntoDict(const Dictionary& displayTemplate,
                                                                       const Value& display,
                                                                       Dictionary& lookup);

 private:
  /// The display in the state; absent without a template. The first use makes it and its lookup.
  Value getDisplayFromState(Dictionary& state);
  /// Decodes one message. The binary log gets every packet with a known log code, even if it cannot be
  /// decoded.
  void updateFromLog_usingLookup_usingState(ByteView message, c2k::Lookup& lookup, c2k::State& state);

  c2k::StateEntries _entries;  // the positions of the state's entries
  c2k::Lookup _lookup;         // made from the lookup in the state
  bool _lacksTemplate = false;
};

}  // namespace varnel
