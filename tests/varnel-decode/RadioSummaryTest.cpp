#include "programs/varnel-decode/RadioSummary.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <pty.h>
#include <unistd.h>

#include <array>

#include "tests/support/DictionaryOf.h"
#include "tests/varnel-decode/DecodeProgram.h"

namespace varnel {
namespace {

using ::testing::EndsWith;
using ::testing::StartsWith;

Value lteGroup() {
  return dictionaryOf(
      {{"Serving Cell", dictionaryOf({{"Cell Identity", Value("619020")},
                                      {"Physical Cell ID", Value("256")},
                                      {"EARFCN", Value("37900")},
                                      {"Band", Value("38")},
                                      {"PLMN", Value("001-01")}})},
       {"Measurements",
        dictionaryOf({{"RSRP", Value("-69.19 dBm")}, {"RSRQ", Value("-3.81 dB")}, {"RSSI", Value("1")}})},
       {"Registration", dictionaryOf({{"EMM State", Value("Registered")}})}});
}

const char lteLine[] =
    "LTE: cell 619020, PCI 256, EARFCN 37900, band 38, PLMN 001-01, RSRP -69.19 dBm, RSRQ -3.81 dB, "
    "Registered\n";

TEST(RadioSummary, TellsCellBandStrengthAndRegistration) {
  EXPECT_EQ(radioSummary(dictionaryOf({{"LTE", lteGroup()}})), lteLine);
}

TEST(RadioSummary, HasALineForEachRadioOfEachCard) {
  const Value gsm = dictionaryOf(
      {{"GSM Serving Cell",
        dictionaryOf({{"Cell ID", Value("12010")}, {"ARFCN", Value("41")}, {"BSIC", Value("15")}})}});
  const Value process = dictionaryOf({{"MM State", Value("MM_IDLE")}});
  const Value display = dictionaryOf(
      {{"SIM 1", dictionaryOf({{"LTE", lteGroup()}, {"GSM", gsm}})},
       {"SIM 2", dictionaryOf({{"Mobility Management", dictionaryOf({{"Process CS", process}})}})}});
  EXPECT_EQ(radioSummary(display), std::string("SIM 1, ") + lteLine +
                                       "SIM 1, GSM: cell 12010, ARFCN 41, BSIC 15\n"
                                       "SIM 2, GSM and UMTS: calls MM_IDLE\n");
}

TEST(RadioSummary, LeavesOutWhatIsNotKnown) {
  const Value empty = dictionaryOf({{"Serving Cell", dictionaryOf({{"Band", Value("")}})}});
  EXPECT_EQ(radioSummary(dictionaryOf({{"LTE", empty}})), "");
  EXPECT_EQ(radioSummary(Value()), "");
  EXPECT_EQ(radioSummary(dictionaryOf({{"Serving Cell", dictionaryOf({{"Band", Value("1")}})}})), "")
      << "the display of another technology";
  const Value rsrp = dictionaryOf({{"Measurements", dictionaryOf({{"RSRP", Value("-84.00 dBm")}})}});
  EXPECT_EQ(radioSummary(dictionaryOf({{"LTE", rsrp}})), "LTE: RSRP -84.00 dBm\n");
}

// A registration with the network 001-01.
std::string registeredCapture() {
  const std::string registered = littleEndian(2, 1) + littleEndian(3, 1) + littleEndian(0, 2) +
                                 "\x11\xF1\x10" + '\x01' + '\0' + "\x11\xF1\x10" + littleEndian(0x8001, 2) +
                                 littleEndian(1, 1) + littleEndian(0x12345678, 4);
  return pcapHeader() + pcapRecord(afternoon, 0, packet(1, 0xB0EE, registered));
}

TEST_F(DecodeProgram, TextBeginsWithASummary) {
  const std::string path = write("drive.pcap", registeredCapture());
  EXPECT_THAT(run({path}).output, StartsWith("LTE: Registered\n\nLTE\n  Serving Cell\n"));
  EXPECT_THAT(run({"--format", "paths", path}).output, StartsWith("/\n/LTE\n"));
}

TEST_F(DecodeProgram, TextOnATerminalEndsWithTheSummary) {
  const std::string path = write("drive.pcap", registeredCapture());
  int screen = -1, terminal = -1;
  std::array<char, 256> name{};
  ASSERT_EQ(::openpty(&screen, &terminal, name.data(), nullptr, nullptr), 0);
  Process process("/bin/sh", {"-c", "exec " VARNEL_DECODE_PROGRAM " " + path + " >" + name.data()});
  EXPECT_EQ(finish(process).status, 0);
  ::fcntl(screen, F_SETFL, O_NONBLOCK);
  std::string text;
  std::array<char, 4096> part{};
  for (ssize_t size; (size = ::read(screen, part.data(), part.size())) > 0;)
    text.append(part.data(), static_cast<std::size_t>(size));
  EXPECT_THAT(text, EndsWith("\n\r\nLTE: Registered\r\n"));
  EXPECT_THAT(text, StartsWith("LTE\r\n  Serving Cell\r\n"));
  ::close(screen);
  ::close(terminal);
}

}  // namespace
}  // namespace varnel
