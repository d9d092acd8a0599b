#include "LogGenerator/LogGenerator.h"

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"
#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"
#include "base/Log.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

struct Registration {
  std::string_view technology;
  std::unique_ptr<LogGenerator> (*generator)(const Services& services);
};

constexpr Registration registry[] = {
    {technology::ifxGSM, GSMLogGenerator::generator},
    {technology::kalviGSMUMTS, KLV_GSMLogGenerator::generator},
    {technology::kalviCDMA, C2KLogGenerator::generator},
    {technology::kalviLTE, LTELogGenerator::generator},
    {technology::kalviUTRAN2, UTRANLogGenerator::generator},
};

constexpr std::size_t largestHistory = 5;

// Kept: the record ends at the first value that the state lacks, so it may well be empty.
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

std::unique_ptr<LogGenerator> LogGenerator::generatorFromTechnology(const Value& technology,
                                                                    const Services& services) {
  const std::string* name = technology.string();
  if (!name) return nullptr;
  for (const Registration& registration : registry) {
    if (*name == registration.technology) return registration.generator(services);
  }
  return nullptr;
}

std::vector<std::string_view> LogGenerator::technologies() {
  std::vector<std::string_view> names;
  for (const Registration& registration : registry) names.push_back(registration.technology);
  return names;
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
