#include "LogGenerator/C2K/C2KLogGenerator.h"

#include <algorithm>
#include <span>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/PacketDecoders.h"
#include "LogGenerator/LogMessage.h"
#include "base/Log.h"

namespace varnel {

namespace {

constexpr std::string_view templateName = "C2KTemplate";

enum class Length { Exact, Minimum };

struct PacketKind {
  std::uint32_t logCode;
  Length rule;
  std::uint32_t length;  // of the whole packet
  void (*decode)(const Packet& packet, c2k::State& state, c2k::Lookup& lookup);
  std::span<const c2k::Variable> published;
};

// In the order of the start command.
constexpr PacketKind packetKinds[] = {
    {0x108A, Length::Minimum, c2k::fingerC2ISize, c2k::decodeFingerC2I, c2k::fingerC2IVariables},
    {0x1183, Length::Exact, c2k::evdoStatusSize, c2k::decodeEVDOStatus, c2k::evdoStatusVariables},
    {0x1192, Length::Minimum, c2k::flDataRateSize, c2k::decodeFLDataRate, c2k::flDataRateVariables},
    {0x12B6, Length::Minimum, c2k::evdoActiveSetSize, c2k::decodeEVDOActiveSet, c2k::evdoActiveSetVariables},
    {0x119C, Length::Minimum, c2k::subpacketsSize, c2k::decode1xStatus, c2k::oneXStatusVariables},
    {0x119D, Length::Minimum, c2k::subpacketsSize, c2k::decode1xTrafficFER, c2k::oneXTrafficFERVariables},
    {0x127E, Length::Minimum, c2k::rlDataRateSize, c2k::decodeRLDataRate, c2k::rlDataRateVariables},
    {0x134F, Length::Minimum, c2k::systemInfoSize, c2k::decodeSystemInfo, c2k::systemInfoVariables},
};

// Some packet publishes each variable.
static_assert(std::ranges::all_of(c2k::variableNames, [](std::string_view name) {
  return std::ranges::any_of(packetKinds, [&](const PacketKind& kind) {
    return std::ranges::find(kind.published, name, &c2k::Variable::name) != kind.published.end();
  });
}));

bool hasRightLength(const PacketKind& kind, const Packet& packet) {
  const auto length = static_cast<std::uint32_t>(packet.size());
  switch (kind.rule) {
    case Length::Exact:
      if (length == kind.length) return true;
      logError("Log code 0x%x is %u bytes long but should be %u bytes.", kind.logCode, length, kind.length);
      return false;
    case Length::Minimum:
      if (length >= kind.length) return true;
      logError("Log code 0x%x is %u bytes long but must be at least %u bytes.", kind.logCode, length,
               kind.length);
      return false;
  }
  return false;
}

using VariableFormats = std::vector<c2k::VariableFormat>;

// Gives each entry of a template the formats of the variable that it names.
void addFormats(std::string_view section, const Dictionary& entries, const VariableFormats& variables,
                NumberFormats& formats) {
  for (const auto& [key, value] : entries) {
    const std::string_view name = displayNameOfSortedKey(key);
    if (const Dictionary* const inner = value.dictionary()) addFormats(name, *inner, variables, formats);
    const std::string* const variable = value.string();
    if (!variable) continue;
    for (const c2k::VariableFormat& known : variables) {
      if (known.variable.name() == *variable) formats.add(section, name, known.format);
    }
  }
}

// Whether a template has an entry for one of the variables.
bool showsAny(const Dictionary& entries, std::span<const c2k::Variable> variables) {
  return std::ranges::any_of(entries, [&](const Dictionary::Entry& entry) {
    if (const Dictionary* const inner = entry.value.dictionary()) return showsAny(*inner, variables);
    const std::string* const name = entry.value.string();
    return name && std::ranges::find(variables, *name, &c2k::Variable::name) != variables.end();
  });
}

}  // namespace

std::unique_ptr<LogGenerator> C2KLogGenerator::generator(const Services& services) {
  return std::make_unique<C2KLogGenerator>(services);
}

void C2KLogGenerator::updateState_withData(Dictionary& state, ByteView data) {
  if (_entries.display.get(state).isAbsent()) getDisplayFromState(state);
  const Value& placements = _entries.lookup.get(state);
  if (!_lookup.isMadeFrom(placements)) _lookup = c2k::Lookup(placements);
  c2k::State decoderState{state, _entries};
  updateFromLog_usingLookup_usingState(data, _lookup, decoderState);
}

Value C2KLogGenerator::generateLogUsingState(Dictionary& state) {
  Value display = getDisplayFromState(state);
  storeBinDataInState(state);
  updateHistoryInState(state);
  return display;
}

Value C2KLogGenerator::getStartCommand() const {
  Value logCodes = Value::ofArray();
  for (const PacketKind& kind : packetKinds) logCodes.array()->push_back(Value::ofInteger(kind.logCode));
  Value command = Value::ofDictionary();
  command.dictionary()->set("SetState", "Streaming");
  command.dictionary()->set("SetKalviLogCodes", logCodes);
  return command;
}

void C2KLogGenerator::processTemplate_storeDisplayIntoDict_storeLookupIntoDict(
    const Dictionary& displayTemplate, const Value& display, Dictionary& lookup) {
  for (const auto& [key, value] : displayTemplate) {
    if (const Dictionary* section = value.dictionary()) {
      const Value inner = Value::ofDictionary();
      processTemplate_storeDisplayIntoDict_storeLookupIntoDict(*section, inner, lookup);
      display.dictionary()->set(key, inner);
    } else if (const std::string* text = value.string(); text && *text == c2k::sortedMark) {
      display.dictionary()->set(key, c2k::sortedMark);
    } else if (text) {
      display.dictionary()->set(key, "");
      c2k::addPlacement(lookup, *text, key, display);
    }
  }
  logWarning("Processing the template");
}

Value C2KLogGenerator::getDisplayFromState(Dictionary& state) {
  if (const Value& display = state.get(stateKey::display); !display.isAbsent()) return display;
  Value displayTemplate = state.get(stateKey::displayTemplate);
  if (displayTemplate.isAbsent()) displayTemplate = services().resources.propertyList(templateName);
  _lacksTemplate = !displayTemplate.dictionary();
  if (_lacksTemplate) {
    logError("Cannot load C2K template for display");
    return {};
  }
  state.set(stateKey::displayTemplate, displayTemplate);
  Value display = Value::ofDictionary();
  const Value lookup = Value::ofDictionary();
  processTemplate_storeDisplayIntoDict_storeLookupIntoDict(*displayTemplate.dictionary(), display,
                                                           *lookup.dictionary());
  state.set(stateKey::display, display);
  state.set(stateKey::lookup, lookup);
  state.set(stateKey::extraInfo, Value::ofDictionary());
  return display;
}

void C2KLogGenerator::updateFromLog_usingLookup_usingState(ByteView data, c2k::Lookup& lookup,
                                                           c2k::State& state) {
  const auto message = LogMessage::framed(data);
  if (!message) return countMessageNotDecoded();
  // Kept: in spite of the log line, the packet is not dropped.
  if (message->logType() != LogMessage::modemLogType)
    logError("Invalid log type: %x. Dropping.", message->logType());
  const auto kind = std::ranges::find(packetKinds, message->logCode(), &PacketKind::logCode);
  if (kind == std::end(packetKinds)) return countMessageNotDecoded();
  if (hasRightLength(*kind, message->packet())) {
    lookup.setTime(services().clock.now());
    kind->decode(message->packet(), state, lookup);
  } else {
    countMessageNotDecoded();
  }
  collect(message->packet().bytes());
}

NumberFormats C2KLogGenerator::numberFormats() const {
  VariableFormats variables;
  c2k::listEVDOFormats(variables);
  c2k::listSearcherFormats(variables);
  c2k::listDataRateFormats(variables);
  NumberFormats formats;
  const Value displayTemplate = services().resources.propertyList(templateName);
  if (const Dictionary* const entries = displayTemplate.dictionary())
    addFormats({}, *entries, variables, formats);
  return formats;
}

std::vector<CodeSections> C2KLogGenerator::codeSections() const {
  std::vector<CodeSections> list;
  const Value displayTemplate = services().resources.propertyList(templateName);
  for (const PacketKind& kind : packetKinds) {
    CodeSections& entry = list.emplace_back(CodeSections{kind.logCode, {}});
    if (!displayTemplate.dictionary()) continue;
    for (const auto& [key, section] : *displayTemplate.dictionary()) {
      if (section.dictionary() && showsAny(*section.dictionary(), kind.published))
        entry.sections.emplace_back(displayNameOfSortedKey(key));
    }
  }
  return list;
}

// Any log type is accepted, as in decoding.
MessageFate C2KLogGenerator::fateOf(ByteView data) const {
  using enum MessageFate::Outcome;
  const auto message = LogMessage::framed(data);
  if (!message) return {TooShort};
  const std::uint32_t logCode = message->logCode();
  const auto kind = std::ranges::find(packetKinds, logCode, &PacketKind::logCode);
  if (kind == std::end(packetKinds)) return {Unknown, logCode};
  const std::size_t size = message->packet().size();
  if (size < kind->length) return {TooShort, logCode};
  return {kind->rule == Length::Exact && size > kind->length ? TooLong : Decoded, logCode};
}

std::optional<std::string> C2KLogGenerator::missingTemplate() const {
  return _lacksTemplate ? std::optional(std::string(templateName) + ".plist") : std::nullopt;
}

// Like the display, the lookup outlives a reconnection, so a new generator of this kind can go on with it.
bool C2KLogGenerator::changesDisplayOf(const Dictionary& state) const {
  return state.get(stateKey::display).isAbsent() || !state.get(stateKey::lookup).isAbsent();
}

}  // namespace varnel
