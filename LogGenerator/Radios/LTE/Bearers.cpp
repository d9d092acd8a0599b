#include "LogGenerator/Radios/LTE/Bearers.h"

#include <algorithm>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/ShownNumber.h"
#include "base/Dictionary.h"
#include "base/Value.h"

namespace varnel::lte {

namespace {

constexpr std::string_view listEntry = "Contexts", identityEntry = "Bearer ID", stateEntry = "State",
                           connectionEntry = "Connection ID";

constexpr Format unknown = integer("Unknown (%u)");
constexpr std::string_view types[] = {"Default", "Dedicated"};
constexpr std::string_view states[] = {"Inactive", "Active Pending", "Active", "Modify Pending"};
constexpr std::uint8_t inactive = 0, noType = 255, noConnection = 255;

constexpr Field type[] = {{u8(1), "Type", entry(types, unknown)}};
constexpr Field contextIdentity[] = {{u8(2), identityEntry}};
constexpr Field contextState[] = {{u8(3), stateEntry, entry(states, unknown)}};
constexpr std::size_t contextSize = 20;

constexpr Field stateIdentity[] = {{u8(1), identityEntry}};
constexpr Field state[] = {{u8(2), stateEntry, entry(states, unknown)}};
constexpr Field connection[] = {{u8(3), connectionEntry}};
constexpr std::size_t stateSize = 4;

// ---- The quality of service ----

// 3GPP TS 24.301, 9.9.4.3. The length counts the bytes that follow it. The first of them is the class, the
// next four are bit rates, and the last four extend these, each in the same order.
constexpr std::size_t qualityLength = 10, firstQuality = 11, extensionDistance = 4;
constexpr Field qualityClass[] = {{u8(firstQuality), "QCI"}};
struct Rate {
  std::string_view entry;
  std::size_t offset;  // in the payload
};
constexpr Rate rates[] = {
    {"Maximum Rate Uplink", 12},
    {"Maximum Rate Downlink", 13},
    {"Guaranteed Rate Uplink", 14},
    {"Guaranteed Rate Downlink", 15},
};
constexpr Format rateFormat = integer("%d kbit/s");

// Rates are in kbit/s.
constexpr std::int32_t kilobits(std::uint8_t coded) {
  if (coded < 64) return coded;
  if (coded < 128) return 64 + 8 * (coded - 64);
  if (coded < 255) return 576 + 64 * (coded - 128);
  return 0;
}

// Absent for values that the standard does not define.
constexpr std::optional<std::int32_t> extendedKilobits(std::uint8_t coded) {
  if (coded == 0 || coded > 250) return std::nullopt;
  if (coded <= 74) return 8'600 + 100 * coded;
  if (coded <= 186) return 16'000 + 1'000 * (coded - 74);
  return 128'000 + 2'000 * (coded - 186);
}

// Bytes behind the length that the packet tells read as absent.
std::uint8_t qualityByte(const Packet& body, std::size_t offset) {
  return offset - firstQuality < body.u8(qualityLength) ? body.u8(offset) : 0;
}

// An extension counts instead of the byte that it extends.
std::optional<std::int32_t> rateOf(const Packet& body, const Rate& rate) {
  const std::uint8_t extension = qualityByte(body, rate.offset + extensionDistance);
  if (extension != 0) return extendedKilobits(extension);
  const std::int32_t plain = kilobits(qualityByte(body, rate.offset));
  return plain > 0 ? std::optional(plain) : std::nullopt;
}

void addQuality(Dictionary& record, const Packet& body) {
  if (body.u8(qualityLength) > 0) setFields(record, body, qualityClass);
  for (const Rate& rate : rates) {
    if (const auto itsRate = rateOf(body, rate)) setInteger(record, rate.entry, rateFormat, *itsRate);
  }
}

// ---- The records ----

// A record without its identity counts as one of 0.
unsigned identityOf(const Value& record) {
  const Dictionary* const fields = record.dictionary();
  return fields ? shownNumber<unsigned>(fields->get(identityEntry)).value_or(0) : 0;
}

// Lets `change(Value&)` make a record from the one that is shown, which is absent for a new bearer. The
// record goes when it is left absent.
template <class Change>
void changeRecord(Section& section, unsigned identity, Change change) {
  const Dictionary* const entries = section.container().dictionary();
  const Array* const shown = entries ? entries->get(listEntry).array() : nullptr;
  Array contexts = shown ? *shown : Array();
  auto place =
      std::ranges::find_if(contexts, [&](const Value& record) { return identityOf(record) >= identity; });
  if (place == contexts.end() || identityOf(*place) != identity) place = contexts.emplace(place);
  Value record = place->shallowCopy();
  change(record);
  if (record.isAbsent()) {
    contexts.erase(place);
  } else {
    *place = std::move(record);
  }
  section.set(listEntry, Value::ofArray(std::move(contexts)));
}

void showContext(Section& section, const Packet& body) {
  constexpr Source identity = contextIdentity[0].source, itsState = contextState[0].source;
  changeRecord(section, rawValue(body, identity), [&](Value& record) {
    const Value old = std::exchange(record, Value());
    if (rawValue(body, itsState) == inactive) return;
    record = recordOf(body, contextIdentity);
    Dictionary& fields = *record.dictionary();
    if (rawValue(body, type[0].source) != noType) setFields(fields, body, type);
    setFields(fields, body, contextState);
    addQuality(fields, body);
    if (old.dictionary()) fields.set(connectionEntry, old.dictionary()->get(connectionEntry));
  });
}

void showState(Section& section, const Packet& body) {
  changeRecord(section, rawValue(body, stateIdentity[0].source), [&](Value& record) {
    if (rawValue(body, state[0].source) == inactive) return void(record = Value());
    if (record.isAbsent()) record = recordOf(body, stateIdentity);
    Dictionary& fields = *record.dictionary();
    setFields(fields, body, state);
    if (rawValue(body, connection[0].source) != noConnection) {
      setFields(fields, body, connection);
    } else {
      fields.remove(connectionEntry);
    }
  });
}

constexpr PacketLayout layouts[] = {
    {0xB0E5, 1, contextSize, showContext},
    {0xB0E4, 1, stateSize, showState},
};

}  // namespace

Bearers::Bearers() : VersionedDecoder("Bearers", layouts) {}

void Bearers::listNumberFormats(SectionFormats& formats) const {
  for (const Rate& rate : rates) formats.add(rate.entry, rateFormat);
}

}  // namespace varnel::lte
