#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "platform/TelephonyService.h"
#include "tests/support/DistinctValues.h"
#include "tests/support/SimulatedMessages.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::AnyOf;
using testing::Contains;
using testing::Ge;
using testing::Le;
using testing::MatchesRegex;
using testing::UnorderedElementsAre;

using Message = SimulatedPacket;

std::vector<Message> messages(std::uint64_t seed, std::chrono::milliseconds duration) {
  return simulatedMessages("kalvi-lte", seed, duration);
}

std::vector<Message> messagesOf(unsigned code, std::chrono::milliseconds duration, std::uint64_t seed = 1) {
  return simulatedMessagesOf(code, "kalvi-lte", seed, duration);
}

TEST(LTEModem, TheMessagesAreTheSameOnEveryMachine) {
  const Message first = messagesOf(0xB0C2, 1s, 1).at(0);
  EXPECT_EQ(first.packet, (Bytes{0x01, 0x25, 0x00, 0xC2, 0xB0, 0x14, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00,
                                 0x02, 0x6C, 0x01, 0x0C, 0x94, 0x0C, 0x94, 0x64, 0x64, 0x0C, 0x5C, 0x1F, 0x00,
                                 0x2D, 0x32, 0x26, 0x00, 0x00, 0x00, 0x01, 0x00, 0x02, 0x01, 0x00, 0x00}));
}

// The layouts of later versions are others.
TEST(LTEModem, PacketsHaveTheVersionsOfTheirLayouts) {
  std::map<unsigned, std::set<unsigned>> versions;
  for (const Message& message : messages(1, 2min)) {
    if (message.code() >= 0xB000 && message.code() <= 0xBFFF) versions[message.code()].insert(message.u8(13));
  }
  EXPECT_EQ(versions,
            (std::map<unsigned, std::set<unsigned>>{
                {0xB0C1, {1}}, {0xB0C2, {2}}, {0xB179, {2}}, {0xB17F, {3}}, {0xB180, {3}}, {0xB186, {1}}}));
}

struct Carrier {
  unsigned band, firstDownlink, lastDownlink, uplinkOffset;
};
const std::map<unsigned, Carrier> carriers = {
    {3, {3, 1200, 1949, 18000}},   {7, {7, 2750, 3449, 18000}}, {8, {8, 3450, 3799, 18000}},
    {20, {20, 6150, 6449, 18000}}, {38, {38, 37750, 38249, 0}},
};

TEST(LTEModem, ServingCellsAreBelievable) {
  for (const Message& cell : messagesOf(0xB0C2, 40min)) {
    ASSERT_EQ(cell.packet.size(), 38u);
    EXPECT_LE(cell.u16(14), 503u);
    const Carrier& carrier = carriers.at(cell.u32(28));
    EXPECT_THAT(cell.u16(16), AllOf(Ge(carrier.firstDownlink), Le(carrier.lastDownlink)));
    EXPECT_EQ(cell.u16(18), cell.u16(16) + carrier.uplinkOffset);
    EXPECT_THAT(cell.u8(20), AnyOf(6, 15, 25, 50, 75, 100));
    EXPECT_EQ(cell.u8(21), cell.u8(20));
    EXPECT_LT(cell.u32(22), 1u << 28);
    EXPECT_THAT(cell.u16(26), AllOf(Ge(1u), Le(0xFFFDu)));
  }
}

// One round through the town.
TEST(LTEModem, TheWalkLeadsThroughCellsOfEveryAreaAndOfSeveralBands) {
  const auto cells = messagesOf(0xB0C2, 40min);
  EXPECT_GE(distinctValues(cells, [](const Message& cell) { return cell.u32(22); }).size(), 20u);
  EXPECT_EQ(distinctValues(cells, [](const Message& cell) { return cell.u16(26); }).size(), 3u);
  EXPECT_GE(distinctValues(cells, [](const Message& cell) { return cell.u32(28); }).size(), 2u);
}

TEST(LTEModem, TheServingCellChangesWithinMinutes) {
  for (const std::uint64_t seed : {1, 2, 3, 4, 5}) {
    std::set<unsigned> identities;
    for (const Message& cell : messagesOf(0xB0C2, 5min, seed)) identities.insert(cell.u32(22));
    EXPECT_GE(identities.size(), 3u) << seed;
  }
}

TEST(LTEModem, ACellKeepsItsArea) {
  std::map<unsigned, unsigned> areas;
  for (const Message& cell : messagesOf(0xB0C2, 40min)) {
    const auto [known, isNew] = areas.emplace(cell.u32(22), cell.u16(26));
    EXPECT_EQ(known->second, cell.u16(26));
  }
}

// What a measurement says about a cell of the carrier, in its own units.
struct Cell {
  unsigned channel, code;
  auto operator<=>(const Cell&) const = default;
};

// The fields of 0xB17F with levels.
struct ServingMeasurement {
  explicit ServingMeasurement(const Message& message)
      : cell{message.u16(17), message.u16(19) & 0x1FF},
        measuredRSRP(message.u16(21) & 0x1FF),
        averageRSRP(message.u16(22) >> 1 & 0x1FF),
        measuredRSRQ(message.u16(23) >> 2 & 0x7F),
        averageRSRQ(message.u8(24) >> 1),
        rssi(message.u16(25) & 0x1FF),
        left(message.u8(29) & 0x7F) {}

  Cell cell;
  unsigned measuredRSRP, averageRSRP, measuredRSRQ, averageRSRQ, rssi, left;
};

TEST(LTEModem, IdleAndConnectedPhasesFollowEachOther) {
  struct Phase {
    bool isConnected;
    std::chrono::milliseconds start;
  };
  std::vector<Phase> phases;
  for (const Message& message : messages(1, 10min)) {
    const bool isConnected = message.code() == 0xB179;
    if (!isConnected && message.code() != 0xB17F && message.code() != 0xB180) continue;
    if (phases.empty() || phases.back().isConnected != isConnected)
      phases.push_back({isConnected, message.at});
  }
  EXPECT_GE(phases.size(), 20u);
  EXPECT_FALSE(phases.at(0).isConnected);
  for (std::size_t i = 1; i < phases.size(); ++i) EXPECT_GE(phases[i].start - phases[i - 1].start, 6s) << i;
}

TEST(LTEModem, ServingCellMeasurementsComeEveryOneOrTwoSecondsOfIdling) {
  const auto all = messagesOf(0xB17F, 12s);
  EXPECT_THAT(all.size(), AllOf(Ge(8u), Le(12u)));
}

TEST(LTEModem, ServingCellMeasurementsAreOfTheServingCell) {
  Cell serving{};
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xB0C2) serving = {message.u16(16), message.u16(14)};
    if (message.code() == 0xB17F) {
      EXPECT_EQ(ServingMeasurement(message).cell, serving);
    }
  }
}

TEST(LTEModem, ServingCellMeasurementsAreBelievable) {
  for (const Message& message : messagesOf(0xB17F, 20min)) {
    ASSERT_EQ(message.packet.size(), 33u);
    const ServingMeasurement measurement(message);
    // From -120 to -40 dBm, in quarters above -140, and -19.5 to -2 dB above -30.
    EXPECT_THAT(measurement.averageRSRP, AllOf(Ge(80u), Le(400u)));
    EXPECT_THAT(measurement.averageRSRQ, AllOf(Ge(42u), Le(112u)));
    EXPECT_NEAR(measurement.measuredRSRP, measurement.averageRSRP, 9);
    EXPECT_NEAR(measurement.measuredRSRQ, measurement.averageRSRQ, 9);
    // The six resource blocks measured have 7.78 dB more than one.
    const double rsrp_dbm = measurement.averageRSRP * 0.25 - 140,
                 rsrq_db = measurement.averageRSRQ * 0.25 - 30;
    EXPECT_NEAR(measurement.rssi * 0.5 - 140, rsrp_dbm + 7.78 - rsrq_db, 0.8);
    EXPECT_NEAR(measurement.left - 30.0, rsrp_dbm + 124, 1);  // above the minimum
  }
}

TEST(LTEModem, ServingCellMeasurementsTellWhatTheNetworkBroadcasts) {
  for (const Message& message : messagesOf(0xB17F, 20min)) {
    EXPECT_THAT(message.u8(20) >> 1 & 0xF, AnyOf(5u, 6u));  // priority
    EXPECT_EQ(message.u8(26) >> 1 & 0x3F, 8u);              // -124 dBm
    EXPECT_EQ(message.u16(26) >> 7 & 0x7F, 53u);            // 23 dBm
    EXPECT_EQ(message.u16(27) >> 6 & 0x3F, 53u);            // 23 dBm
    EXPECT_EQ((message.u16(29) >> 7) & 0x3F, 0u);           // no cycle without coverage
    EXPECT_EQ(message.u16(30) >> 5 & 0x3F, 29u);            // 58 dB
    EXPECT_EQ(message.u16(31) >> 3 & 0x3F, 22u);            // 44 dB
  }
}

TEST(LTEModem, OtherTechnologiesAreMeasuredNearTheMinimum) {
  const auto all = messagesOf(0xB17F, 20min);
  for (const Message& message : all)
    EXPECT_EQ(message.u8(32) >> 2 & 0xF, ServingMeasurement(message).left > 74 ? 1u : 5u);
  EXPECT_GE(distinctValues(all, [](const Message& message) { return message.u8(32); }).size(), 3u);
}

TEST(LTEModem, LevelAndQualityOfTheServingCellVary) {
  std::vector<ServingMeasurement> all;
  for (const Message& message : messagesOf(0xB17F, 20min)) all.emplace_back(message);
  EXPECT_GE(distinctValues(all, &ServingMeasurement::averageRSRP).size(), 50u);
  EXPECT_GE(distinctValues(all, &ServingMeasurement::averageRSRQ).size(), 10u);
}

TEST(LTEModem, TheCellMonitorHasTheLevelOfTheMeasurements) {
  struct Monitored {
    std::int64_t code, rssi_dbm;
    std::chrono::milliseconds at;
  };
  std::optional<Monitored> monitored;
  int compared = 0;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xFF0001) {
      const Value serving = message.payload().array()->at(0);
      monitored = {numberOf(serving, cellMonitor::physicalCellIdentity), numberOf(serving, cellMonitor::rssi),
                   message.at};
    }
    if (message.code() != 0xB17F || !monitored || message.at - monitored->at > 200ms) continue;
    const ServingMeasurement measurement(message);
    if (measurement.cell.code != monitored->code) continue;
    EXPECT_NEAR(measurement.rssi * 0.5 - 140, static_cast<double>(monitored->rssi_dbm), 4);
    ++compared;
  }
  EXPECT_GE(compared, 50);
}

// Where the cells of 0xB180 begin.
std::vector<std::size_t> neighborRecords(const Message& message) {
  const unsigned count = (message.u16(19) >> 6 & 0x1F) + 1;
  EXPECT_EQ(message.packet.size(), 21 + 20 * count);
  std::vector<std::size_t> records;
  for (std::size_t i = 0; i < count; ++i) records.push_back(21 + 20 * i);
  return records;
}

std::set<unsigned> neighborCodes(const Message& message) {
  return distinctValues(neighborRecords(message),
                        [&](std::size_t record) { return message.u16(record) & 0x1FF; });
}

TEST(LTEModem, IdleNeighborsAreOtherCellsThanTheServingOne) {
  Cell serving{};
  for (const Message& message : messages(1, 10min)) {
    if (message.code() == 0xB0C2) serving = {message.u16(16), message.u16(14)};
    if (message.code() != 0xB180) continue;
    const auto codes = neighborCodes(message);
    EXPECT_EQ(codes.size(), neighborRecords(message).size());
    EXPECT_TRUE(message.u16(17) != serving.channel || !codes.contains(serving.code));
    EXPECT_LE(*codes.rbegin(), 503u);
  }
}

TEST(LTEModem, MeasurementsOfIdleNeighborsAreBelievable) {
  for (const Message& message : messagesOf(0xB180, 10min)) {
    EXPECT_EQ(message.u8(19) & 0x3F, 8u);  // -124 dBm
    for (const std::size_t record : neighborRecords(message)) {
      const unsigned rssi = message.u16(record + 1) >> 1 & 0xFF, average = message.u16(record + 4) & 0x1FF;
      const unsigned measured = message.u16(record + 2) >> 1 & 0x1FF;
      // From -124 to -40 dBm, in halves above -140, and -19.5 to -2 dB, in quarters above -30.
      EXPECT_THAT(average, AllOf(Ge(32u), Le(200u)));
      EXPECT_NEAR(measured, average, 5);
      EXPECT_LT(average, rssi);
      EXPECT_EQ(rssi, message.u16(22) >> 1 & 0xFF);  // one for the carrier
      EXPECT_THAT(message.u8(record + 6) & 0x7F, AllOf(Ge(42u), Le(112u)));
      EXPECT_NEAR(message.u8(record + 5) >> 1, message.u8(record + 6) & 0x7F, 9);
      EXPECT_NEAR((message.u16(record + 6) >> 7 & 0x7F) - 30.0, average * 0.5 - 140 + 124, 1);
    }
  }
}

TEST(LTEModem, TimesOfIdleNeighborsAreBelievable) {
  for (const Message& message : messagesOf(0xB180, 10min)) {
    for (const std::size_t record : neighborRecords(message)) {
      EXPECT_LE(message.u16(record + 8), 300u);
      EXPECT_LE(message.u16(record + 12) & 0x7FF, 1023u);
      // Ten milliseconds of samples, 19 bits from bit 3 on.
      const unsigned sample = (message.u16(record + 13) | message.u8(record + 15) << 16) >> 3;
      EXPECT_LT(sample, 307'204u);
    }
  }
}

TEST(LTEModem, IdleNeighborsEnterAndLeave) {
  std::map<unsigned, std::set<unsigned>> heard;  // by carrier
  int entered = 0, left = 0;
  for (const Message& message : messagesOf(0xB180, 10min)) {
    const auto codes = neighborCodes(message);
    const auto [carrier, isNew] = heard.try_emplace(message.u16(17), codes);
    for (const unsigned code : codes) entered += !carrier->second.contains(code);
    for (const unsigned code : carrier->second) left += !codes.contains(code);
    carrier->second = codes;
  }
  EXPECT_GE(heard.size(), 2u);
  EXPECT_GE(entered, 10);
  EXPECT_GE(left, 10);
}

// The cells of 0xB179.
std::vector<unsigned> measuredNeighbors(const Message& message) {
  std::vector<unsigned> codes;
  for (std::size_t i = 0; i < message.u8(27); ++i) codes.push_back(message.u16(29 + 6 * i));
  return codes;
}
std::vector<unsigned> detectedCells(const Message& message) {
  std::vector<unsigned> codes;
  for (std::size_t i = 0; i < message.u8(28); ++i)
    codes.push_back(message.u16(29 + 6 * message.u8(27) + 2 * i));
  return codes;
}

TEST(LTEModem, ConnectedMeasurementsTellTheCellsOfTheServingCarrier) {
  Cell serving{};
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xB0C2) serving = {message.u16(16), message.u16(14)};
    if (message.code() != 0xB179) continue;
    EXPECT_EQ((Cell{message.u16(17), message.u16(19)}), serving);
    const auto neighbors = measuredNeighbors(message), detected = detectedCells(message);
    std::set<unsigned> codes{serving.code};
    codes.insert(neighbors.begin(), neighbors.end());
    codes.insert(detected.begin(), detected.end());
    EXPECT_EQ(codes.size(), 1 + neighbors.size() + detected.size());
    EXPECT_LE(*codes.rbegin(), 503u);
  }
}

TEST(LTEModem, ConnectedMeasurementsAreBelievable) {
  for (const Message& message : messagesOf(0xB179, 20min)) {
    ASSERT_EQ(message.packet.size(), 29 + 6 * message.u8(27) + 2 * message.u8(28));
    EXPECT_LT(message.u16(21), 10'240u);
    // From -120 to -40 dBm, in quarters above -140, and -19.5 to -2 dB, in eighths above -20.
    EXPECT_THAT(message.u16(23), AllOf(Ge(80u), Le(400u)));
    EXPECT_THAT(message.u16(25), AllOf(Ge(4u), Le(144u)));
    for (std::size_t record = 29; record < 29 + 6 * message.u8(27); record += 6) {
      EXPECT_THAT(message.u16(record + 2), AllOf(Ge(64u), Le(400u)));
      EXPECT_THAT(message.u16(record + 4), AllOf(Ge(4u), Le(144u)));
    }
  }
}

TEST(LTEModem, ManyCellsAreMeasuredAndDetectedWhileConnected) {
  std::set<unsigned> neighbors, detected;
  for (const Message& message : messagesOf(0xB179, 20min)) {
    for (const unsigned code : measuredNeighbors(message)) neighbors.insert(code);
    for (const unsigned code : detectedCells(message)) detected.insert(code);
  }
  EXPECT_GE(neighbors.size(), 10u);
  EXPECT_GE(detected.size(), 10u);
}

TEST(LTEModem, TheLevelVariesWhileConnected) {
  const auto all = messagesOf(0xB179, 20min);
  EXPECT_GE(distinctValues(all, [](const Message& message) { return message.u16(23); }).size(), 50u);
}

TEST(LTEModem, ReselectionCandidatesComeOneAtATimeAndAreOfEveryTechnology) {
  std::map<unsigned, std::set<unsigned>> priorities;  // by technology
  for (const Message& message : messagesOf(0xB186, 10min)) {
    EXPECT_TRUE(carriers.at(3).firstDownlink <= message.u16(15) && message.u16(15) <= 38249)
        << message.u16(15);
    EXPECT_LE(message.u16(17), 503u);
    ASSERT_EQ(message.u16(19), 1u);
    const unsigned technology = message.u16(23);
    priorities[technology].insert(message.u16(21));
    ASSERT_EQ(message.packet.size(), technology < 3 ? 29u : 33u);
    switch (technology) {
      case 0:
        EXPECT_THAT(message.u16(25), AllOf(Ge(1200u), Le(38249u)));
        EXPECT_LE(message.u16(27) >> 7, 503u);
        EXPECT_EQ(message.u16(27) & 0x7F, 0u);
        break;
      case 1:
        EXPECT_EQ(message.u16(25), 10588u);
        EXPECT_LE(message.u16(27), 511u);
        break;
      case 2:
        EXPECT_THAT(message.u16(25), AllOf(Ge(10u), Le(50u)));
        EXPECT_EQ(message.u8(27), 8u);
        EXPECT_LE(message.u8(28), 63u);
        break;
      case 3:
      case 4:
        EXPECT_EQ(message.u8(25), 0u);
        EXPECT_EQ(message.u16(29), technology == 3 ? 283u : 78u);
        EXPECT_LE(message.u16(31), 511u);
        EXPECT_EQ(message.u16(31) % 4, 0u);
        break;
      default:
        ADD_FAILURE() << technology;
    }
  }
  EXPECT_EQ(priorities,
            (std::map<unsigned, std::set<unsigned>>{{0, {5, 6}}, {1, {4}}, {2, {2}}, {3, {1}}, {4, {3}}}));
}

TEST(LTEModem, AnIdlePhoneTellsACandidateBeforeItReselectsIt) {
  std::optional<Cell> serving;
  bool isConnected = false;
  int reselections = 0;
  Message previous;
  for (const Message& message : messages(1, 20min)) {
    if (message.code() == 0xB179) isConnected = true;
    if (message.code() == 0xB17F) isConnected = false;
    if (message.code() == 0xB0C2) {
      const Cell cell{message.u16(16), message.u16(14)};
      if (serving && cell != *serving && !isConnected) {
        ++reselections;
        ASSERT_EQ(previous.code(), 0xB186u) << message.at.count();
        EXPECT_EQ((Cell{previous.u16(15), previous.u16(17)}), *serving);
        EXPECT_EQ(previous.u16(23), 0u);
        EXPECT_EQ((Cell{previous.u16(25), previous.u16(27) >> 7}), cell);
      }
      serving = cell;
    }
    previous = message;
  }
  EXPECT_GE(reselections, 5);
}

TEST(LTEModem, AntennasAreOneTwoOrFour) {
  const auto all = messagesOf(0xB0C1, 10min);
  EXPECT_GE(all.size(), 60u);
  for (const Message& message : all) {
    ASSERT_EQ(message.packet.size(), 22u);
    EXPECT_THAT(message.u8(20), AnyOf(1, 2, 4));
  }
}

TEST(LTEModem, SimFilesAreTexts) {
  const auto all = messagesOf(0xFF0000, 10min);
  EXPECT_GE(all.size(), 9u);
  const Value files = all.at(0).payload();
  ASSERT_NE(files.dictionary(), nullptr);
  EXPECT_EQ(files.dictionary()->size(), 14u);
  for (const auto& file : *files.dictionary()) {
    EXPECT_TRUE(file.key.starts_with("kSimFile_")) << file.key;
    ASSERT_NE(file.value.string(), nullptr) << file.key;
    EXPECT_FALSE(file.value.string()->empty()) << file.key;
  }
  EXPECT_THAT(textOf(files, "kSimFile_ICCID"), MatchesRegex("8900101[0-9]{12}"));
}

TEST(LTEModem, TheSimCardRegistersInTheServingCellsArea) {
  unsigned area = 0;
  std::set<std::string> locations;
  for (const Message& message : messages(1, 30min)) {
    if (message.code() == 0xB0C2) area = message.u16(26);
    if (message.code() != 0xFF0000 || area == 0) continue;
    const std::string location = textOf(message.payload(), "kSimFile_LOCI");
    char areaText[24];
    std::snprintf(areaText, sizeof areaText, "LAI 001-01-%04X", area);
    EXPECT_NE(location.find(areaText), std::string::npos) << location << ", not " << areaText;
    locations.insert(location);
  }
  EXPECT_GE(locations.size(), 3u);
}

TEST(LTEModem, TheCellMonitorTellsTheServingCellAndNeighborsOfEveryTechnology) {
  std::set<std::string> technologies;
  std::set<std::int64_t> levels;
  for (const Message& message : messagesOf(0xFF0001, 2min)) {
    const Value records = message.payload();
    ASSERT_NE(records.array(), nullptr);
    int serving = 0;
    for (const Value& record : *records.array()) {
      technologies.insert(textOf(record, cellMonitor::radioAccessTechnology));
      if (textOf(record, cellMonitor::cellType) != cellMonitor::serving) continue;
      ++serving;
      EXPECT_EQ(textOf(record, cellMonitor::radioAccessTechnology), "LTE");
      EXPECT_EQ(numberOf(record, cellMonitor::mcc), 1);
      EXPECT_EQ(numberOf(record, cellMonitor::mnc), 1);
      EXPECT_THAT(numberOf(record, cellMonitor::physicalCellIdentity), AllOf(Ge(0), Le(503)));
      const Carrier& carrier = carriers.at(static_cast<unsigned>(numberOf(record, cellMonitor::bandInfo)));
      EXPECT_THAT(numberOf(record, cellMonitor::uarfcn),
                  AllOf(Ge(carrier.firstDownlink), Le(carrier.lastDownlink)));
      EXPECT_THAT(numberOf(record, cellMonitor::rssi), AllOf(Ge(-130), Le(-40)));
      levels.insert(numberOf(record, cellMonitor::rssi));
    }
    EXPECT_EQ(serving, 1);
  }
  EXPECT_THAT(technologies, UnorderedElementsAre("GSM", "LTE", "UMTS", "UTRAN"));
  EXPECT_GE(levels.size(), 5u);
}

TEST(LTEModem, TheCellMonitorAgreesWithTheModem) {
  std::map<std::int64_t, std::int64_t> areas;
  for (const Message& message : messages(1, 5min)) {
    if (message.code() == 0xB0C2) areas[message.u32(22)] = message.u16(26);
    if (message.code() != 0xFF0001) continue;
    const Value serving = message.payload().array()->at(0);
    ASSERT_TRUE(areas.contains(numberOf(serving, cellMonitor::cellIdentity)));
    EXPECT_EQ(numberOf(serving, cellMonitor::trackingAreaCode),
              areas[numberOf(serving, cellMonitor::cellIdentity)]);
  }
}

TEST(LTEModem, PacketDataContextsComeAndGo) {
  std::set<std::size_t> counts;
  std::set<std::string> accessPoints, states, received;
  for (const Message& message : messagesOf(0xFF0002, 10min)) {
    const Value contexts = message.payload();
    ASSERT_NE(contexts.array(), nullptr);
    counts.insert(contexts.array()->size());
    for (const Value& context : *contexts.array()) {
      for (const auto& row : *context.dictionary()) EXPECT_NE(row.value.string(), nullptr) << row.key;
      accessPoints.insert(textOf(context, "APN"));
      states.insert(textOf(context, "State"));
      if (textOf(context, "APN") == "internet") received.insert(textOf(context, "Bytes Received"));
    }
  }
  EXPECT_GE(counts.size(), 2u);
  EXPECT_THAT(accessPoints, UnorderedElementsAre("ims", "internet", "mms"));
  EXPECT_THAT(states, Contains("Active"));
  EXPECT_GE(states.size(), 2u);
  EXPECT_GE(received.size(), 50u);
}

}  // namespace
}  // namespace varnel
