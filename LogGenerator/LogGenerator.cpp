#include "LogGenerator/LogGenerator.h"

#include "base/Log.h"

namespace varnel {

namespace {

constexpr std::size_t largestHistory = 5;

// Kept: the record ends at the first value that the state lacks, so it can be empty.
Value snapshotRecord(const Dictionary& state, const std::string& date) {
  Value record = Value::ofDictionary();
  for (const auto key : {stateKey::displayState, stateKey::display, stateKey::extraInfo}) {
    const Value& part = state.get(key);
    if (part.isAbsent()) return record;
    record.dictionary()->set(key, part.shallowCopy());
  }
  record.dictionary()->set("Date", date);
  record.dictionary()->set("Description", "Snapshot (" + date + ")");
  return record;
}

}  // namespace

LogGenerator::LogGenerator(const Services& services) : _services(services) {
  logWarning("Creating Log object: %p", static_cast<const void*>(this));
}

void LogGenerator::updateHistoryInState(Dictionary& state) const {
  Array* history = state.get(stateKey::history).array();
  if (!history) {
    state.set(stateKey::history, Value::ofArray());
    history = state.get(stateKey::history).array();
  }
  if (history->size() >= largestHistory) {
    history->erase(history->begin(), history->end() - static_cast<std::ptrdiff_t>(largestHistory - 1));
  }
  history->push_back(snapshotRecord(state, dateDescription(_services.clock.now())));
}

}  // namespace varnel
