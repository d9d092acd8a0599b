#include "programs/varnel-telephonyd/simulation/PacketData.h"

#include "base/Dictionary.h"

namespace varnel::simulation {

namespace {
constexpr int firstContextID = 5;
}  // namespace

// The addresses are from ranges that are reserved for documentation.
const PacketData::Purpose PacketData::purposes[] = {
    {"ims", "IPv6", "2001:db8:1::", 5, 1, 3600, 300},
    {"internet", "IPv4v6", "192.0.2.", 9, 12, 90, 400'000},
    {"mms", "IPv4", "198.51.100.", 8, 30, 12, 20'000},
};

PacketData::PacketData(Random random) : _random(random) {
  for (const Purpose& purpose : purposes)
    _contexts.push_back({&purpose, State::Inactive, _random.between(1, purpose.longestIdle_s), 0, 0, 0});
}

void PacketData::step() {
  for (Context& context : _contexts) {
    if (context.state == State::Active) transfer(context);
    if (--context.left_s <= 0) enterNextState(context);
  }
}

void PacketData::enterNextState(Context& context) {
  const Purpose& purpose = *context.purpose;
  switch (context.state) {
    case State::Inactive:
      context = {&purpose, State::Activating, 1, _random.between(1, 250), 0, 0};
      return;
    case State::Activating:
      context.state = State::Active;
      context.left_s = _random.between(purpose.longestUse_s / 2, purpose.longestUse_s);
      return;
    case State::Active:
      context.state = State::Deactivating;
      context.left_s = 1;
      return;
    case State::Deactivating:
      context.state = State::Inactive;
      context.left_s = _random.between(1, purpose.longestIdle_s);
      return;
  }
}

void PacketData::transfer(Context& context) {
  // Nothing is sent between bursts.
  if (_random.oneIn(3)) return;
  context.received_bytes += _random.between(40, context.purpose->fastest_bytes);
  context.sent_bytes += _random.between(40, 40 + context.purpose->fastest_bytes / 8);
}

const char* PacketData::name(State state) {
  switch (state) {
    case State::Inactive:
      return "Inactive";
    case State::Activating:
      return "Activating";
    case State::Active:
      return "Active";
    case State::Deactivating:
      return "Deactivating";
  }
  return "";
}

Value PacketData::contexts() const {
  Value list = Value::ofArray();
  int contextID = firstContextID;
  for (const Context& context : _contexts) {
    if (context.state != State::Inactive) list.array()->push_back(rows(context, contextID));
    ++contextID;
  }
  return list;
}

Value PacketData::rows(const Context& context, int contextID) {
  const Purpose& purpose = *context.purpose;
  const std::string address = purpose.addressPrefix + std::to_string(context.addressNumber);
  Value entry = Value::ofDictionary();
  Dictionary& rows = *entry.dictionary();
  rows.set("Context ID", std::to_string(contextID));
  rows.set("APN", purpose.accessPoint);
  rows.set("State", name(context.state));
  rows.set("Type", purpose.type);
  rows.set("Address", context.state == State::Activating ? "" : address);
  rows.set("QCI", std::to_string(purpose.qualityClass));
  rows.set("Bytes Sent", std::to_string(context.sent_bytes));
  rows.set("Bytes Received", std::to_string(context.received_bytes));
  return entry;
}

}  // namespace varnel::simulation
