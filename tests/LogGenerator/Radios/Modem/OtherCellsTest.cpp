#include "LogGenerator/Radios/Modem/OtherCells.h"

#include <gtest/gtest.h>

#include "tests/LogGenerator/Radios/Modem/ModemReports.h"

namespace varnel::modem {
namespace {

class ModemOtherCells : public testing::Test {
 protected:
  std::string shownOf(Array cells) { return shownAfter(decoder, {reportOfCells(std::move(cells))}, section); }

  ReportReader reader;
  OtherCells decoder{reader};
  Value section = Value::ofArray();
};

TEST_F(ModemOtherCells, NeighborsHaveTheirRadioAndWhatWasMeasured) {
  EXPECT_EQ(shownOf({cellOf("LTE", "Neighbor",
                            {{"EARFCN", Value::ofInteger(5230)},
                             {"PhysicalCellIdentity", Value::ofInteger(17)},
                             {"RSRP", Value::ofReal(-101.5)},
                             {"RSRQ", Value::ofReal(-12)}}),
                     cellOf("NR", "Neighbor",
                            {{"NR-ARFCN", Value::ofInteger(632628)},
                             {"PhysicalCellIdentity", Value::ofInteger(900)},
                             {"SINR", Value::ofReal(3)}}),
                     cellOf("GSM", "Neighbor", {{"RSSI", Value::ofInteger(-300)}})}),
            R"([{Radio: "LTE", Type: "Neighbor", EARFCN: "5230", Band: "13", )"
            R"(Downlink Frequency: "751.0 MHz", Physical Cell ID: "17", RSRP: "-101.50 dBm", )"
            R"(RSRQ: "-12.00 dB"}, )"
            R"({Radio: "NR", Type: "Neighbor", NR-ARFCN: "632628", Band: "n78, n77", )"
            R"(Downlink Frequency: "3489.420 MHz", Physical Cell ID: "900", SINR: "3.0 dB"}, )"
            R"({Radio: "GSM", Type: "Neighbor"}])");
}

TEST_F(ModemOtherCells, TheSecondServingCellOfARadioIsOneOfThem) {
  const auto serving = [](const char* radio, std::int64_t cell) {
    return cellOf(radio, "Serving", {{"PhysicalCellIdentity", Value::ofInteger(cell)}});
  };
  EXPECT_EQ(shownOf({serving("LTE", 1), serving("NR", 2), serving("LTE", 3), serving("NR", 4)}),
            R"([{Radio: "LTE", Type: "Serving", Physical Cell ID: "3"}, )"
            R"({Radio: "NR", Type: "Serving", Physical Cell ID: "4"}])");
}

TEST_F(ModemOtherCells, CellsOfUnknownRadiosAndTypesAreLeftOut) {
  EXPECT_EQ(shownOf({cellOf("6G", "Neighbor", {}), cellOf("LTE", "Friend", {}),
                     dictionaryOf({{"RadioAccessTechnology", "LTE"}}), "LTE"}),
            "[]");
}

TEST_F(ModemOtherCells, EachReportIsTheWholeList) {
  shownOf({cellOf("LTE", "Neighbor", {}), cellOf("NR", "Neighbor", {})});
  EXPECT_EQ(shownOf({cellOf("GSM", "Neighbor", {})}), R"([{Radio: "GSM", Type: "Neighbor"}])");
}

TEST_F(ModemOtherCells, AtMost256CellsAreRead) {
  shownOf(Array(300, cellOf("LTE", "Neighbor", {})));
  EXPECT_EQ(section.array()->size(), 256u);
}

}  // namespace
}  // namespace varnel::modem
