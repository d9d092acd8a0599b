#include "programs/varnel-telephonyd/Options.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

namespace varnel {
namespace {

using testing::HasSubstr;

struct Reading {
  std::variant<Options, ExitStatus> choice;
  std::string output, error;

  const Options& options() const { return std::get<Options>(choice); }
};

Reading read(std::vector<const char*> arguments) {
  arguments.insert(arguments.begin(), "varnel-telephonyd");
  testing::internal::CaptureStdout();
  testing::internal::CaptureStderr();
  auto choice = readOptions(static_cast<int>(arguments.size()), arguments.data(), "9.8.7");
  return {choice, testing::internal::GetCapturedStdout(), testing::internal::GetCapturedStderr()};
}

TEST(TelephonydOptions, ASimulation) {
  const Reading reading =
      read({"--simulate", "kalvi-lte", "--seed", "7", "--runtime-dir", "run", "--log-level", "5"});
  EXPECT_EQ(reading.error, "");
  EXPECT_EQ(reading.options().simulatedTechnology, "kalvi-lte");
  EXPECT_EQ(reading.options().seed, 7u);
  EXPECT_EQ(reading.options().runtimeFolder, "run");
  EXPECT_FALSE(reading.options().allowedGroup);
  EXPECT_EQ(reading.options().logLevel, 5);
  EXPECT_EQ(reading.options().recordPath, std::nullopt);
}

TEST(TelephonydOptions, AGroupWhoseMembersMayConnect) {
  const Reading reading = read({"--simulate", "kalvi-lte", "--allow-group", "viewers"});
  EXPECT_EQ(reading.error, "");
  EXPECT_EQ(reading.options().allowedGroup, "viewers");
}

TEST(TelephonydOptions, AModemsPort) {
  const Reading reading = read({"--port", "/dev/ttyUSB0", "--record", "a"});
  EXPECT_EQ(reading.error, "");
  EXPECT_EQ(reading.options().portPath, "/dev/ttyUSB0");
  EXPECT_EQ(reading.options().recordPath, "a");
  EXPECT_FALSE(reading.options().simulatedTechnology);
  EXPECT_FALSE(reading.options().inhibitsModemManager);
}

TEST(TelephonydOptions, APortNeedsAName) {
  EXPECT_EQ(read({"--port", ""}).error,
            "varnel-telephonyd: --port needs the name of a device, such as /dev/ttyUSB0, or auto; see "
            "varnel-telephonyd --help\n");
}

TEST(TelephonydOptions, ModemManagerCanBeInhibitedForAPort) {
  EXPECT_TRUE(read({"--port", "auto", "--inhibit"}).options().inhibitsModemManager);
  EXPECT_THAT(read({"--replay", "a", "--inhibit"}).error, HasSubstr("--inhibit requires --port"));
}

TEST(TelephonydOptions, WithoutASourceTheServerTakesWhatIsThere) {
  const Reading reading = read({"--record", "a"});
  EXPECT_EQ(reading.error, "");
  EXPECT_TRUE(namesNoSource(reading.options()));
  EXPECT_FALSE(namesNoSource(read({"--live"}).options()));
  EXPECT_FALSE(namesNoSource(read({"--port", "auto"}).options()));
  EXPECT_FALSE(namesNoSource(read({"--simulate", "kalvi-lte"}).options()));
}

TEST(TelephonydOptions, AModemOfModemManager) {
  const Reading reading =
      read({"--live", "--modem", "1", "--poll", "2", "--record", "a", "--record-position"});
  EXPECT_EQ(reading.error, "");
  EXPECT_TRUE(reading.options().isLive);
  EXPECT_EQ(reading.options().modem, "1");
  EXPECT_EQ(reading.options().poll_s, 2u);
  EXPECT_TRUE(reading.options().recordsPosition);
  const Reading plain = read({"--live"});
  EXPECT_EQ(plain.options().modem, "");
  EXPECT_EQ(plain.options().poll_s, 5u);
  EXPECT_FALSE(plain.options().recordsPosition);
}

TEST(TelephonydOptions, OptionsOfModemManagersModemGoWithNothingElse) {
  EXPECT_THAT(read({"--modem", "1"}).error, HasSubstr("--modem requires --live"));
  EXPECT_THAT(read({"--poll", "1"}).error, HasSubstr("--poll requires --live"));
  EXPECT_THAT(read({"--live", "--poll", "0"}).error, HasSubstr("--poll"));
  EXPECT_THAT(read({"--live", "--poll", "3601"}).error, HasSubstr("--poll"));
  EXPECT_THAT(read({"--live", "--record-position"}).error, HasSubstr("--record-position requires --record"));
  EXPECT_THAT(read({"--simulate", "kalvi-lte", "--record", "a", "--record-position"}).error,
              HasSubstr("--record-position requires --live"));
  for (const char* source : {"--port", "--replay", "--simulate"})
    EXPECT_THAT(read({"--live", source, "kalvi-lte"}).error, HasSubstr("excludes")) << source;
}

TEST(TelephonydOptions, ASimulatedModemMayHaveAPortThatIsServedElsewhere) {
  EXPECT_TRUE(read({"--simulate", "kalvi-lte", "--pty"}).options().playsPort);
  EXPECT_FALSE(read({"--simulate", "kalvi-lte"}).options().playsPort);
  EXPECT_THAT(read({"--replay", "walk.pcap", "--pty"}).error, HasSubstr("--pty requires --simulate"));
  EXPECT_THAT(read({"--simulate", "kalvi-lte", "--pty", "--record", "a"}).error,
              HasSubstr("--pty excludes --record"));
  EXPECT_THAT(read({"--simulate", "ifx-gsm", "--pty"}).error, HasSubstr("has no diagnostic port to play"));
}

TEST(TelephonydOptions, AReplayAndItsDefaults) {
  const Reading reading = read({"--replay", "walk.pcap"});
  EXPECT_EQ(reading.error, "");
  EXPECT_EQ(reading.options().replayPath, "walk.pcap");
  EXPECT_FALSE(reading.options().replayTechnology);
  EXPECT_EQ(reading.options().speed, 1);
  EXPECT_FALSE(reading.options().loops);
  EXPECT_EQ(reading.options().logLevel, 3);
}

TEST(TelephonydOptions, AReplayMayBeFasterAndStartOver) {
  const Reading reading = read({"--replay", "walk.pcap", "--technology", "kalvi-utran-2", "--speed", "2.5",
                                "--loop", "--record", "a"});
  EXPECT_EQ(reading.options().replayTechnology, "kalvi-utran-2");
  EXPECT_EQ(reading.options().speed, 2.5);
  EXPECT_TRUE(reading.options().loops);
  EXPECT_EQ(reading.options().recordPath, "a");
  EXPECT_EQ(reading.options().existingRecording, ExistingRecording::Refused);
}

TEST(TelephonydOptions, AReplayMayBeOfOneSubscription) {
  EXPECT_EQ(read({"--replay", "walk.pcap", "--sim", "2"}).options().subscription, 2u);
  EXPECT_EQ(read({"--replay", "walk.pcap"}).options().subscription, std::nullopt);
  EXPECT_EQ(read({"--replay", "walk.pcap", "--technology", "all-radios"}).options().replayTechnology,
            "all-radios");
}

TEST(TelephonydOptions, ARecordingMayReplaceAnEarlierOneWhereThatIsSaid) {
  const Reading reading = read({"--simulate", "kalvi-lte", "--record", "a", "--overwrite"});
  EXPECT_EQ(reading.error, "");
  EXPECT_EQ(reading.options().existingRecording, ExistingRecording::Replaced);
}

TEST(TelephonydOptions, ARecordingIsNamedByTheTimeOfTheStart) {
  const Reading reading = read({"--simulate", "kalvi-lte", "--record", "walk-%%-%Y"});
  EXPECT_EQ(reading.error, "");
  const std::string name = reading.options().recordPath.value();
  EXPECT_TRUE(name.starts_with("walk-%-2")) << name;
  EXPECT_EQ(name.size(), 11u) << name;
  EXPECT_TRUE(reading.options().recordPathIsOfNow);
  EXPECT_FALSE(read({"--simulate", "kalvi-lte", "--record", "walk"}).options().recordPathIsOfNow);
}

TEST(TelephonydOptions, AFaultForTests) {
  EXPECT_EQ(read({"--simulate", "kalvi-lte"}).options().fault, Fault{});
  EXPECT_EQ(read({"--simulate", "kalvi-lte", "--fault", "crash@7"}).options().fault,
            (Fault{Fault::Kind::Crash, 7}));
}

TEST(TelephonydOptions, MistakesAreOneLineAndStatusTwo) {
  const std::vector<std::vector<const char*>> mistakes = {
      {"--poll", "2"},
      {"--port"},
      {"--port", "/dev/ttyUSB0", "--simulate", "kalvi-lte"},
      {"--port", "/dev/ttyUSB0", "--replay", "walk.pcap"},
      {"--port", "/dev/ttyUSB0", "--technology", "kalvi-lte"},
      {"--simulate", "kalvi-5g"},
      {"--replay", "walk.pcap", "--technology", "kalvi-5g"},
      {"--simulate", "kalvi-lte", "--replay", "walk.pcap"},
      {"--simulate", "kalvi-lte", "--speed", "2"},
      {"--replay", "walk.pcap", "--seed", "2"},
      {"--replay", "walk.pcap", "--speed", "0"},
      {"--replay", "walk.pcap", "--speed", "nan"},
      {"--replay", "walk.pcap", "--sim", "0"},
      {"--replay", "walk.pcap", "--sim", "256"},
      {"--simulate", "kalvi-lte", "--sim", "1"},
      {"--simulate", "kalvi-lte", "--fault", "dance"},
      {"--simulate", "kalvi-lte", "--record", ""},
      {"--replay", "-", "--loop"},
      {"--replay", "/etc/passwd", "--record", "/etc/../etc/passwd"},
      {"--replay", "/etc/no-such-file", "--record", "/etc/../etc/no-such-file"},
      {"--simulate", "kalvi-lte", "--overwrite"},
      {"--simulate", "kalvi-lte", "--nonsense"},
      {"--simulate", "kalvi-lte", "--seed", "x"},
  };
  for (const auto& arguments : mistakes) {
    const Reading reading = read(arguments);
    ASSERT_TRUE(std::holds_alternative<ExitStatus>(reading.choice)) << testing::PrintToString(arguments);
    EXPECT_EQ(std::get<ExitStatus>(reading.choice).code, 2);
    EXPECT_EQ(reading.output, "");
    EXPECT_TRUE(reading.error.starts_with("varnel-telephonyd: ")) << reading.error;
    EXPECT_EQ(std::ranges::count(reading.error, '\n'), 1) << reading.error;
  }
}

TEST(TelephonydOptions, HelpAndVersionGoToStandardOutput) {
  const Reading help = read({"--help"});
  EXPECT_EQ(std::get<ExitStatus>(help.choice).code, 0);
  for (const char* option :
       {"--port", "--simulate", "--seed", "--replay", "--technology", "--speed", "--loop", "--record",
        "--overwrite", "--runtime-dir", "--fault", "--log-level", "--version"})
    EXPECT_THAT(help.output, HasSubstr(option));
  const Reading version = read({"--version"});
  EXPECT_EQ(std::get<ExitStatus>(version.choice).code, 0);
  EXPECT_EQ(version.output, "varnel-telephonyd 9.8.7\n");
}

TEST(TelephonydOptions, TheHelpTellsWhomAGroupNeedsAndWhereTheRuntimeFolderIsAtLast) {
  std::istringstream lines(read({"--help"}).output);
  std::string text;
  for (std::string word; lines >> word;) text += word + ' ';
  EXPECT_THAT(text, HasSubstr("members of this one group connect too"));
  EXPECT_THAT(text, HasSubstr("this user must be a member"));
  EXPECT_THAT(text, HasSubstr("varnel-UID in the temporary folder (/tmp)"));
}

}  // namespace
}  // namespace varnel
