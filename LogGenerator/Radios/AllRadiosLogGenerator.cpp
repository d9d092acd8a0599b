#include "LogGenerator/Radios/AllRadiosLogGenerator.h"

#include <string>
#include <tuple>
#include <utility>

#include "LogGenerator/LogMessage.h"
#include "LogGenerator/SortedKey.h"
#include "base/Log.h"
#include "base/MessagePrefix.h"

namespace varnel {

namespace {

constexpr std::string_view templateName = "AllRadios";

// The state's entry with all groups, shown or not, by subscription. It also tells that the display is of this
// kind.
constexpr std::string_view groupsKey = "Groups";

// The dictionary under a key, which is made if it is not there.
Value dictionaryAt(Dictionary& entries, std::string_view key) {
  if (!entries.get(key).dictionary()) entries.set(key, Value::ofDictionary());
  return entries.get(key);
}

}  // namespace

AllRadiosLogGenerator::AllRadiosLogGenerator(const Services& services) : KLVLogGenerator(services) {}

AllRadiosLogGenerator::~AllRadiosLogGenerator() {
  // At the time of the last message: a display that nobody renews keeps the cells that were seen then.
  for (auto& [number, subscription] : _subscriptions) {
    if (const auto time = subscription.groups.lastTaken()) subscription.groups.prepareDisplay(*time);
  }
}

const Value& AllRadiosLogGenerator::displayTemplate() const {
  if (!_template) {
    _template = services().resources.propertyList(templateName);
    if (!_template->dictionary()) logError("Cannot load the template of all radios for display");
  }
  return *_template;
}

const RadioGroups& AllRadiosLogGenerator::unbound() const {
  if (!_unbound) _unbound.emplace(services(), displayTemplate());
  return *_unbound;
}

std::unique_ptr<LogGenerator> AllRadiosLogGenerator::generator(const Services& services) {
  return std::make_unique<AllRadiosLogGenerator>(services);
}

void AllRadiosLogGenerator::updateState_withData(Dictionary& state, ByteView data) {
  collect(data);
  const bool hasDisplay = hasDisplayIn(state);
  const auto message = LogMessage::framed(data);
  if (!message || !message->isOfKnownType() || !hasDisplay) return countMessageNotDecoded();
  const SubscriptionNumber number = subscriptionOf(data).value_or(0);
  Subscription* const subscription = subscriptionIn(state, number);
  if (!subscription || !subscription->groups.take(*message, data)) return countMessageNotDecoded();
  showIfAny(*subscription, number, state);
}

void AllRadiosLogGenerator::showIfAny(Subscription& subscription, SubscriptionNumber number,
                                      Dictionary& state) {
  const std::size_t marks = 1;
  if (subscription.isShown || subscription.display.dictionary()->size() == marks) return;
  state.get(stateKey::display).dictionary()->set(subscriptionName(number), subscription.display);
  subscription.isShown = true;
}

bool AllRadiosLogGenerator::hasDisplayIn(Dictionary& state) {
  if (_isBound) return true;
  if (!changesDisplayOf(state)) return false;
  if (state.get(stateKey::display).isAbsent()) {
    if (!displayTemplate().dictionary()) return false;
    Value display = Value::ofDictionary();
    display.dictionary()->set(sortMark, "");
    state.set(stateKey::display, std::move(display));
    state.set(groupsKey, Value::ofDictionary());
    state.set(stateKey::extraInfo, Value::ofDictionary());
  }
  _isBound = true;
  return true;
}

AllRadiosLogGenerator::Subscription* AllRadiosLogGenerator::subscriptionIn(Dictionary& state,
                                                                           SubscriptionNumber number) {
  if (const auto known = _subscriptions.find(number); known != _subscriptions.end()) return &known->second;
  const std::size_t numbered = _subscriptions.size() - _subscriptions.count(0);
  if (number != 0 && numbered == mostSubscriptions) return nullptr;
  Subscription& subscription = _subscriptions
                                   .emplace(std::piecewise_construct, std::forward_as_tuple(number),
                                            std::forward_as_tuple(services(), displayTemplate()))
                                   .first->second;
  const Value& whole = state.get(stateKey::display);
  const Value& earlier = whole.dictionary()->get(subscriptionName(number));
  subscription.isShown = number == 0 || earlier.dictionary();
  subscription.display = number == 0 ? whole : earlier.dictionary() ? earlier : Value::ofDictionary();
  subscription.groups.bind(dictionaryAt(*state.get(groupsKey).dictionary(), subscriptionName(number)),
                           subscription.display);
  return &subscription;
}

Value AllRadiosLogGenerator::generateLogUsingState(Dictionary& state) {
  if (hasDisplayIn(state)) {
    const Time now = services().clock.now();
    for (auto& [number, subscription] : _subscriptions) {
      subscription.groups.prepareDisplay(now);
      showIfAny(subscription, number, state);
    }
  }
  storeBinDataInState(state);
  updateHistoryInState(state);
  return state.get(stateKey::display);
}

Value AllRadiosLogGenerator::getStartCommand() const { return startCommandFor(unbound().logCodes()); }

MessageFate AllRadiosLogGenerator::fateOf(ByteView data) const {
  const auto message = LogMessage::framed(data);
  if (!message) return {MessageFate::Outcome::TooShort};
  return unbound().fateOf(*message, data);
}

NumberFormats AllRadiosLogGenerator::numberFormats() const { return unbound().numberFormats(); }

std::vector<CodeSections> AllRadiosLogGenerator::codeSections() const { return unbound().codeSections(); }

std::optional<std::string> AllRadiosLogGenerator::missingTemplate() const {
  if (!_template || _template->dictionary()) return std::nullopt;
  return std::string(templateName) + ".plist";
}

bool AllRadiosLogGenerator::changesDisplayOf(const Dictionary& state) const {
  return state.get(stateKey::display).isAbsent() || !state.get(groupsKey).isAbsent();
}

std::optional<Time> AllRadiosLogGenerator::writtenAt(const Dictionary& entries, std::string_view key) const {
  for (const auto& [number, subscription] : _subscriptions) {
    if (const auto time = subscription.groups.writtenAt(entries, key)) return time;
  }
  return std::nullopt;
}

std::optional<Time> AllRadiosLogGenerator::refilledAt(const Array& list) const {
  for (const auto& [number, subscription] : _subscriptions) {
    if (const auto time = subscription.groups.refilledAt(list)) return time;
  }
  return std::nullopt;
}

}  // namespace varnel
