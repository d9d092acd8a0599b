#include "LogGenerator/GSM/GSMLogGenerator.h"

#include <string>
#include <utility>

#include "base/Assertion.h"
#include "base/PropertyList.h"

namespace varnel {

namespace {

// Kept: failures are known by this file name and these lines, which are not the real ones.
constexpr const char* assertionFile = "LogGenerator/GSM/GSMLogGenerator";
constexpr int unknownObjectLine = 78;
constexpr int unreadableObjectLine = 90;

// The name of a kind that has no display form.
constexpr const char* kindName(Value::Kind kind) {
  switch (kind) {
    case Value::Kind::Integer:
      return "integer";
    case Value::Kind::Real:
      return "real";
    case Value::Kind::Boolean:
      return "boolean";
    case Value::Kind::Date:
      return "date";
    case Value::Kind::Data:
      return "data";
    default:
      return "(null)";
  }
}

// Processing does not change the number of a dictionary's entries, so the dictionary can be collapsed first.
Value processChild(const Value& child) {
  const Value onlyEntry = GSMLogGenerator::canCollapse(child);
  return onlyEntry.isAbsent() ? GSMLogGenerator::processObject(child) : processChild(onlyEntry);
}

Value processEntries(const Dictionary& entries) {
  Value processed = Value::ofDictionary();
  processed.dictionary()->reserve(entries.size());
  for (const auto& [key, value] : entries) processed.dictionary()->set(key, processChild(value));
  return processed;
}

Value processElements(const Array& elements) {
  Array processed;
  processed.reserve(elements.size());
  // Kept: the first element of every array is left out.
  for (std::size_t i = 1; i < elements.size(); ++i) processed.push_back(processChild(elements[i]));
  return Value::ofArray(std::move(processed));
}

}  // namespace

std::unique_ptr<LogGenerator> GSMLogGenerator::generator(const Services& services) {
  return std::make_unique<GSMLogGenerator>(services);
}

Value GSMLogGenerator::canCollapse(const Value& object) {
  const Dictionary* entries = object.dictionary();
  return entries && entries->size() == 1 ? entries->begin()->value : Value();
}

// The recursion is as deep as the property list, whose depth its reader limits.
Value GSMLogGenerator::processObject(const Value& object) {
  if (object.string()) return object;
  if (const Dictionary* entries = object.dictionary()) return processEntries(*entries);
  if (const Array* elements = object.array()) return processElements(*elements);
  throw AssertionFailure(assertionFile, unknownObjectLine,
                         std::string("Unknown object of type ") + kindName(object.kind()) + " encountered");
}

void GSMLogGenerator::updateState_withData(Dictionary& state, ByteView data) {
  const auto object = readPropertyList(data);
  if (!object)
    throw AssertionFailure(assertionFile, unreadableObjectLine, "Could not deserialize the object");
  Value display = processObject(*object);
  _received = services().clock.now();
  state.set(stateKey::displayState, *object);
  state.set(stateKey::display, std::move(display));
  state.set(stateKey::extraInfo, Value::ofDictionary());
}

Value GSMLogGenerator::generateLogUsingState(Dictionary& state) {
  updateHistoryInState(state);
  return state.get(stateKey::display);
}

Value GSMLogGenerator::getStartCommand() const {
  Value command = Value::ofDictionary();
  command.dictionary()->set("SetState", "Streaming");
  return command;
}

Value GSMLogGenerator::getSaveContentsFromState(const Dictionary& state) const {
  const Array* history = state.get(stateKey::history).array();
  return Value::ofArray(history ? *history : Array());
}

}  // namespace varnel
