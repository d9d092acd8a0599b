#include "LogGenerator/KLVLogGenerator2.h"

#include "LogGenerator/LogMessage.h"
#include "base/Log.h"

namespace varnel {

namespace {

// This line must come before the log lines of the base classes.
const Services& announceCreation(const Services& services, const ClassIndex* classIndex) {
  // Kept: a success, logged as an error.
  logError("Creating KLVLogGenerator2 object with %p", static_cast<const void*>(classIndex));
  return services;
}

}  // namespace

KLVLogGenerator2::KLVLogGenerator2(const Services& services, std::string listName,
                                   std::shared_ptr<ClassIndex> classIndex)
    : KLVLogGenerator(announceCreation(services, classIndex.get())),
      pListName(std::move(listName)),
      cIndex(std::move(classIndex)) {
  // Kept: a success, logged as an error. The number is that of the owners of the class index.
  logError("Class Index: %ld", cIndex.use_count());
}

KLVLogGenerator2::~KLVLogGenerator2() {
  // Kept: every generator with a template writes this line, under any name.
  logWarning("KLV_GSMLogGenerator is destructed %p", static_cast<const void*>(this));
}

void KLVLogGenerator2::updateState_withData(Dictionary& state, ByteView data) {
  getDisplayFromState(state);
  updateWithData(data);
  collect(data);
}

void KLVLogGenerator2::updateWithData(ByteView data) {
  const auto message = LogMessage::framed(data);
  if (!message) return countMessageNotDecoded();
  if (!message->isOfKnownType()) {
    logError("Invalid log type: %x. Dropping.", message->logType());
    return countMessageNotDecoded();
  }
  const std::uint32_t logCode = message->logCode();
  const auto* subscription = cIndex ? cIndex->subscription(logCode) : nullptr;
  if (!subscription) return countMessageNotDecoded();
  if (message->packet().size() < subscription->shortestTaken) [[unlikely]]
    countMessageNotDecoded();
  const Time now = services().clock.now();
  for (const Subscriber& subscriber : subscription->subscribers) {
    subscriber.decoder->section().setTime(now);
    subscriber.deliver(message->packet(), logCode);
  }
}

MessageFate KLVLogGenerator2::fateOf(ByteView data) const {
  using enum MessageFate::Outcome;
  const auto message = LogMessage::framed(data);
  if (!message) return {TooShort};
  if (!message->isOfKnownType()) return {Unknown};
  const std::uint32_t logCode = message->logCode();
  const auto* subscription = cIndex ? cIndex->subscription(logCode) : nullptr;
  if (!subscription) return {Unknown, logCode};
  return {message->packet().size() < subscription->shortestTaken ? TooShort : Decoded, logCode};
}

std::optional<std::string> KLVLogGenerator2::missingTemplate() const {
  if (!_lacksTemplate) return std::nullopt;
  return pListName + ".plist";
}

// If the state already has a display, it belongs to another generator, and so do its sections.
bool KLVLogGenerator2::changesDisplayOf(const Dictionary& state) const {
  return _hasBuiltDisplay || state.get(stateKey::display).isAbsent();
}

NumberFormats KLVLogGenerator2::numberFormats() const {
  NumberFormats formats;
  if (cIndex) cIndex->listNumberFormats(formats);
  return formats;
}

std::vector<CodeSections> KLVLogGenerator2::codeSections() const {
  return cIndex ? cIndex->codeSections() : std::vector<CodeSections>();
}

std::optional<Time> KLVLogGenerator2::writtenAt(const Dictionary& entries, std::string_view key) const {
  const Section* section = cIndex ? cIndex->sectionIn(entries) : nullptr;
  return section ? section->writtenAt(key) : std::nullopt;
}

std::optional<Time> KLVLogGenerator2::refilledAt(const Array& list) const {
  const Section* section = cIndex ? cIndex->sectionIn(list) : nullptr;
  return section ? section->refilledAt() : std::nullopt;
}

Value KLVLogGenerator2::getDisplayFromState(Dictionary& state) {
  if (const Value& display = state.get(stateKey::display); !display.isAbsent()) return display;
  Value displayTemplate = state.get(stateKey::displayTemplate);
  if (displayTemplate.isAbsent()) {
    if (cIndex) displayTemplate = services().resources.propertyList(pListName);
    _lacksTemplate = displayTemplate.isAbsent();
    if (_lacksTemplate) {
      logError("Cannot load template for display");
      return {};
    }
    state.set(stateKey::displayTemplate, displayTemplate);
  }
  logWarning("Initialized class index: %p, Self: %p", static_cast<const void*>(cIndex.get()),
             static_cast<const void*>(this));
  if (cIndex) cIndex->status();
  const Value display = processTemplate(displayTemplate);
  printDict(display);
  state.set(stateKey::display, display);
  _hasBuiltDisplay = true;
  state.set(stateKey::extraInfo, Value::ofDictionary());
  return {};
}

Value KLVLogGenerator2::processTemplate(const Value& object) {
  if (object.string()) return object;
  if (const Dictionary* entries = object.dictionary()) {
    Value copy = Value::ofDictionary();
    copy.dictionary()->reserve(entries->size());
    for (const auto& [key, value] : *entries) {
      const Value processed = processTemplate(value);
      if (Base* decoder = cIndex ? cIndex->getClass(key) : nullptr) decoder->updateSectionRef(processed);
      copy.dictionary()->set(key, processed);
    }
    return copy;
  }
  if (const Array* elements = object.array()) {
    Value copy = Value::ofArray();
    for (const Value& element : *elements) {
      if (Value processed = processTemplate(element); !processed.isAbsent()) {
        copy.array()->push_back(std::move(processed));
      }
    }
    return copy;
  }
  logError("Received an object of unknown type");
  logWarning("Processing the template");
  return {};
}

void KLVLogGenerator2::printDict(const Value& object) {
  if (object.string()) return;
  if (const Dictionary* entries = object.dictionary()) {
    for (const auto& [key, value] : *entries) printDict(value);
  } else if (const Array* elements = object.array()) {
    for (const Value& element : *elements) printDict(element);
  } else {
    logError("Received an object of unknown type");
  }
}

Value KLVLogGenerator2::generateLogUsingState(Dictionary& state) {
  Value display = getDisplayFromState(state);
  storeBinDataInState(state);
  updateHistoryInState(state);
  return display;
}

Value KLVLogGenerator2::getStartCommand() const {
  return startCommandFor(cIndex ? cIndex->logCodes() : std::span<const std::uint32_t>());
}

}  // namespace varnel
