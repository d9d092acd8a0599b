#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "LogGenerator/LogGenerator.h"
#include "app/ValueHistory.h"
#include "host/FileResources.h"
#include "platform/TelephonyService.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AnyOf;
using testing::HasSubstr;
using testing::IsSupersetOf;

std::vector<std::string> namesOf(const std::string& path) {
  std::vector<std::string> names;
  for (std::size_t begin = 1; begin <= path.size();) {
    const std::size_t end = std::min(path.find('/', begin), path.size());
    names.push_back(path.substr(begin, end - begin));
    begin = end + 1;
  }
  return names;
}

// Lets a simulated modem send for some minutes, and keeps a generation per 20 messages. Each number on
// display must have a series, but in lists whose records are about nothing that stays. Yields the keys of all
// series.
std::vector<std::string> keysOfModem(std::string_view technology) {
  TestServices host;
  const RecordingLog log;
  const FileResources resources{resourceFolder()};
  const auto generator = LogGenerator::generatorFromTechnology(
      technology, {resources, host.services.clock, host.services.application, host.services.standardOutput});
  const NumberFormats formats = generator->numberFormats();
  ValueHistory history(formats);
  Dictionary state;
  std::int64_t second = 1'700'000'000;
  int count = 0;
  for (const SimulatedPacket& message : simulatedMessages(technology, 1, 3min)) {
    generator->updateState_withData(state, message.packet);
    if (++count % 20 != 0) continue;
    second += 2;
    host.clock.set({second});
    PathDictionary paths;
    history.add(VarnelModelNode::makeTreeFromObject_withPathDictionary(
                    generator->generateLogUsingState(state), paths, *generator),
                {second});
    for (const auto& [path, node] : paths) {
      if (!node->value() || history.seriesOf(*node) || formats.number(namesOf(path), *node->value()).empty())
        continue;
      EXPECT_THAT(path, AnyOf(HasSubstr("/Last Messages/Messages/"), HasSubstr("/Equivalent PLMN List/"),
                              HasSubstr("/ARFCNs/")))
          << *node->value();
    }
  }
  std::vector<std::string> keys;
  for (const auto number : history.series()) keys.emplace_back(history.key(number));
  EXPECT_EQ(history.notice(), "");
  return keys;
}

bool isThere(const std::vector<std::string>& keys, std::string_view beginning, std::string_view end) {
  return std::ranges::any_of(
      keys, [&](const std::string& key) { return key.starts_with(beginning) && key.ends_with(end); });
}

TEST(SimulatedHistory, OfLTE) {
  const auto keys = keysOfModem(technology::kalviLTE);
  EXPECT_THAT(keys, IsSupersetOf({"/Serving Cell Measurements/Average RSRP"}));
  EXPECT_TRUE(isThere(keys, "/Neighbor Cells List[EARFCN ", "]/Average RSRP"));
  EXPECT_TRUE(isThere(keys, "/Measured Neighbor Cells[EARFCN ", "]/Filtered RSRQ"));
}

TEST(SimulatedHistory, OfUTRAN) {
  const auto keys = keysOfModem(technology::kalviUTRAN2);
  EXPECT_TRUE(isThere(keys, "/Neighbor Cell List[UARFCN ", "]/Filter RSCP"));
  EXPECT_TRUE(isThere(keys, "/CCTRCH SIR[CCTrCH ", "]/SIR/5"));
}

TEST(SimulatedHistory, OfGSMAndUMTS) {
  const auto keys = keysOfModem(technology::kalviGSMUMTS);
  EXPECT_TRUE(isThere(keys, "/UMTS/Active Set[UARFCN ", "]/RSCP"));
  EXPECT_TRUE(isThere(keys, "/GSM/GSM Set[ARFCN ", "]/RSSI"));
}

TEST(SimulatedHistory, OfCDMA2000) {
  const auto keys = keysOfModem(technology::kalviCDMA);
  EXPECT_THAT(keys, IsSupersetOf({"/1x/Rx0 AGC", "/EV-DO/Forward Link Data Rate"}));
  EXPECT_TRUE(isThere(keys, "/EV-DO/Active Set/", ""));
}

TEST(SimulatedHistory, OfTheObjectStream) {
  EXPECT_THAT(keysOfModem(technology::ifxGSM), IsSupersetOf({"/Serving Cell/ARFCN", "/Packet Data/Sent"}));
}

TEST(SimulatedHistory, OfAllRadios) {
  const auto keys = keysOfModem(technology::allRadios);
  EXPECT_TRUE(isThere(keys, "/LTE/Neighbors/Cells[EARFCN ", "]/RSRP"));
  EXPECT_TRUE(isThere(keys, "/NR/Cells/Layers[NR-ARFCN ", "]/RSRP"));
  EXPECT_TRUE(isThere(keys, "/Subscriber/PDP Context Info[Context ", "]/Bytes Sent"));
}

}  // namespace
}  // namespace varnel
