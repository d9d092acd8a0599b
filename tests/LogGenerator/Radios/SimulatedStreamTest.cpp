#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <fstream>
#include <iterator>
#include <string>

#include "LogGenerator/Radios/AllRadiosLogGenerator.h"
#include "base/PropertyList.h"
#include "model/VarnelModelNode.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/TestServices.h"

// The simulated modem and the decoders were written apart from each other.
namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsSupersetOf;
using Outcome = MessageFate::Outcome;

Value shipped(const std::string& resource) {
  std::ifstream file(VARNEL_SOURCE_DIR "/resources/" + resource + ".plist", std::ios::binary);
  const Bytes bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  return readPropertyList(bytes, fileLimits).value_or(Value());
}

class SimulatedStream : public testing::TestWithParam<std::uint64_t> {
 protected:
  SimulatedStream() {
    for (const char* name : {"AllRadios", "C2KTemplate", "KLV_GSM"})
      services.resources.add(name, shipped(name));
    generator = LogGenerator::generatorFromTechnology(std::string(technology::allRadios), services.services);
  }

  void take(std::chrono::milliseconds duration) {
    const auto modem = simulatedModem(technology::allRadios, GetParam());
    for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next()) {
      const MessageFate fate = generator->fateOf(next.bytes);
      EXPECT_EQ(fate.outcome, Outcome::Decoded) << std::hex << fate.logCode.value_or(0);
      generator->updateState_withData(state, next.bytes);
    }
  }

  std::vector<std::string> groups(const std::string& path) {
    PathDictionary paths;
    VarnelModelNode::makeTreeFromObject_withPathDictionary(generator->generateLogUsingState(state), paths);
    std::vector<std::string> names;
    if (const auto found = paths.find(path); found != paths.end() && found->second->childNodes()) {
      for (const auto& child : *found->second->childNodes()) names.push_back(child->displayName());
    }
    return names;
  }

  TestServices services;
  std::unique_ptr<LogGenerator> generator;
  Dictionary state;
};

TEST_P(SimulatedStream, EveryMessageIsKnownAndEveryGroupIsShown) {
  take(4min);
  EXPECT_THAT(groups("/SIM 1"), ElementsAre("LTE", "NR", "UMTS", "GSM", "Mobility Management", "PLMN",
                                            "CDMA2000", "Subscriber", "Messages"));
  EXPECT_THAT(groups("/SIM 2"), IsSupersetOf({"LTE", "GSM", "Subscriber", "Messages"}));
}

INSTANTIATE_TEST_SUITE_P(, SimulatedStream, testing::Values(1, 2, 3));

}  // namespace
}  // namespace varnel
