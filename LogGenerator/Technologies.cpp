#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/KLV/GSMUMTS/KLV_GSMLogGenerator.h"
#include "LogGenerator/KLV/LTE/LTELogGenerator.h"
#include "LogGenerator/KLV/UTRAN/UTRANLogGenerator.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Radios/AllRadiosLogGenerator.h"
#include "platform/TelephonyService.h"

// Only this file knows the generators of all technologies.
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
    {technology::allRadios, AllRadiosLogGenerator::generator},
};

}  // namespace

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

}  // namespace varnel
