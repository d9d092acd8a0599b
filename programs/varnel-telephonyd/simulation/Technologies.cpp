#include "programs/varnel-telephonyd/simulation/Technologies.h"

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/CDMAModem.h"
#include "programs/varnel-telephonyd/simulation/GSMUMTSModem.h"
#include "programs/varnel-telephonyd/simulation/LTEModem.h"
#include "programs/varnel-telephonyd/simulation/ObjectStreamModem.h"
#include "programs/varnel-telephonyd/simulation/UTRANModem.h"
#include "programs/varnel-telephonyd/simulation/radios/AllRadiosModem.h"

namespace varnel {

namespace {

template <class Modem>
std::unique_ptr<SimulatedModem> make(std::uint64_t seed) {
  return std::make_unique<Modem>(seed);
}

struct Simulation {
  std::string_view technology;
  std::unique_ptr<SimulatedModem> (*make)(std::uint64_t seed);
};

constexpr Simulation simulations[] = {
    {technology::ifxGSM, make<simulation::ObjectStreamModem>},
    {technology::kalviGSMUMTS, make<simulation::GSMUMTSModem>},
    {technology::kalviCDMA, make<simulation::CDMAModem>},
    {technology::kalviLTE, make<simulation::LTEModem>},
    {technology::kalviUTRAN2, make<simulation::UTRANModem>},
    {technology::allRadios, make<simulation::AllRadiosModem>},
};

}  // namespace

std::unique_ptr<SimulatedModem> simulatedModem(std::string_view technology, std::uint64_t seed) {
  for (const Simulation& simulation : simulations) {
    if (simulation.technology == technology) return simulation.make(seed);
  }
  return nullptr;
}

std::vector<std::string_view> simulatedTechnologies() {
  std::vector<std::string_view> technologies;
  for (const Simulation& simulation : simulations) technologies.push_back(simulation.technology);
  return technologies;
}

}  // namespace varnel
