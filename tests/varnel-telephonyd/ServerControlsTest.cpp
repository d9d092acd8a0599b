#include "programs/varnel-telephonyd/ServerControls.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "programs/varnel-telephonyd/SimulationSource.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/MemoryPorts.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using Command = ControlRequest::Command;

class ServerControlsTest : public testing::Test {
 protected:
  ServerControls controls(ServedSource source, std::optional<std::string> recording = {}) {
    return ServerControls({.server = _server,
                           .source = source,
                           .name = "name",
                           .recording = std::move(recording),
                           .clients = [] { return 3; },
                           .leftOutOfPort = {},
                           .survey = {},
                           .useTechnology = [this](const std::string& name) { _used.push_back(name); },
                           .stop = [this] { _stopped = true; }});
  }
  static std::string refusal(const ControlReply& reply) {
    const auto* const refusal = std::get_if<ControlRefusal>(&reply);
    return refusal ? refusal->sentence : "";
  }
  void startStream() {
    const std::string command =
        "<plist version=\"1.0\"><dict><key>SetState</key><string>Streaming</string></dict></plist>";
    _ports.deliver(_server.createLogChannel("viewer").portName.value(), 0,
                   Bytes(command.begin(), command.end()));
    _queue.run();
  }

  std::vector<std::string> _used;
  bool _stopped = false;
  MemoryPorts _ports;
  FakeQueue _queue;
  TelephonyServer _server{
      {.ports = _ports,
       .queue = _queue,
       .uptime = [this] { return _queue.now(); },
       .technology = "kalvi-lte",
       .makeSource =
           [] { return std::make_unique<SimulationSource>([] { return simulatedModem("kalvi-lte", 1); }); },
       .messageSent = [](ByteView) {},
       .tell = [](const std::string&) {}}};
};

TEST_F(ServerControlsTest, ALivePortRefusesWhatCannotBeDoneWithIt) {
  ServerControls port = controls(ServedSource::Port);
  EXPECT_EQ(refusal(port.reply({.command = Command::SetSpeed, .speed = 2})),
            "a live port comes at its own speed, which nothing can change");
  EXPECT_EQ(refusal(port.reply({.command = Command::Seek})),
            "a live port has no places to go to: its messages come once");
  EXPECT_EQ(refusal(port.reply({.command = Command::Pause})),
            "a live port cannot be paused: its messages come when they come");
  EXPECT_EQ(refusal(port.reply({.command = Command::Continue})),
            "a live port cannot be paused: its messages come when they come");
  EXPECT_EQ(refusal(port.reply({.command = Command::SetTechnology, .technology = "kalvi-lte"})),
            "a live port keeps its technology; start varnel-telephonyd again to change it");
  EXPECT_FALSE(_server.isPaused());
}

TEST_F(ServerControlsTest, StandardInputRefusesLikeALivePort) {
  ServerControls pipe = controls(ServedSource::StandardInput);
  EXPECT_EQ(refusal(pipe.reply({.command = Command::SetSpeed, .speed = 2})),
            "a replay of standard input comes at its own speed, which nothing can change");
}

TEST_F(ServerControlsTest, ModemManagersModemRefusesLikeALivePort) {
  ServerControls modem = controls(ServedSource::ModemManager);
  EXPECT_EQ(refusal(modem.reply({.command = Command::Pause})),
            "what ModemManager tells cannot be paused: its messages come when they come");
  const ControlReply reply = modem.reply({});
  EXPECT_EQ(std::get<ServerStatus>(reply).source, "ModemManager");
}

TEST_F(ServerControlsTest, MistakesAreToldInOneSentence) {
  ServerControls simulation = controls(ServedSource::Simulation);
  EXPECT_EQ(refusal(simulation.reply({.command = Command::SetSpeed, .speed = 0})),
            "the speed must lie between 0.001 and 1000000");
  EXPECT_EQ(refusal(simulation.reply({.command = Command::Seek, .place = Time{1, 0}})),
            "a simulation has no dates; name the time since its start, as in 1:30");
  EXPECT_EQ(refusal(simulation.reply({.command = Command::Seek, .place = 1s})),
            "there is no stream to seek in: no viewer is connected, and each one starts at the beginning");
  EXPECT_EQ(refusal(simulation.reply({.command = Command::SetTechnology, .technology = "kalvi-5g"})),
            "there is no such technology; there are ifx-gsm, kalvi-gsm-umts, kalvi-cdma, kalvi-lte, "
            "kalvi-utran-2, all-radios");
  EXPECT_TRUE(_used.empty());
}

TEST_F(ServerControlsTest, ARecordingKeepsItsTechnology) {
  ServerControls simulation = controls(ServedSource::Simulation, "walk.pcap");
  EXPECT_EQ(refusal(simulation.reply({.command = Command::SetTechnology, .technology = "all-radios"})),
            "the recording walk.pcap is of one technology; start varnel-telephonyd again to change it");
}

TEST_F(ServerControlsTest, WhatIsDoneShowsInTheStatusThatIsReturned) {
  ServerControls simulation = controls(ServedSource::Simulation);
  startStream();
  auto status = std::get<ServerStatus>(simulation.reply({}));
  EXPECT_EQ(status.source, "simulation");
  EXPECT_EQ(status.technology, "kalvi-lte");
  EXPECT_EQ(status.clients, 3u);
  EXPECT_EQ(status.channels, 1u);
  EXPECT_TRUE(status.isPlayable);
  EXPECT_EQ(status.badFrames, std::nullopt);
  EXPECT_TRUE(std::get<ServerStatus>(simulation.reply({.command = Command::Pause})).isPaused);
  EXPECT_FALSE(std::get<ServerStatus>(simulation.reply({.command = Command::Continue})).isPaused);
  EXPECT_EQ(std::get<ServerStatus>(simulation.reply({.command = Command::SetSpeed, .speed = 2.5})).speed,
            2.5);
  simulation.reply({.command = Command::Seek, .place = 100s});
  _queue.run();
  EXPECT_GE(std::get<ServerStatus>(simulation.reply({})).position.value(), 100s);
  status = std::get<ServerStatus>(
      simulation.reply({.command = Command::SetTechnology, .technology = "all-radios"}));
  EXPECT_EQ(status.technology, "all-radios");
  EXPECT_EQ(status.channels, 0u);
  EXPECT_EQ(_used, (std::vector<std::string>{"all-radios"}));
  simulation.reply({.command = Command::Stop});
  EXPECT_TRUE(_stopped);
}

TEST_F(ServerControlsTest, ASeekInASimulationIsNoLongerThanADay) {
  const char* const tooFar = "a simulation plays at most 24 hours for a seek; name an earlier place";
  ServerControls simulation = controls(ServedSource::Simulation);
  startStream();
  EXPECT_EQ(refusal(simulation.reply({.command = Command::Seek, .place = 900'000'000min})), tooFar);
  const auto position = _server.position().value().sinceStart;
  EXPECT_EQ(refusal(simulation.reply({.command = Command::Seek, .place = position + 24h + 1ms})), tooFar);
  EXPECT_FALSE(_server.isSeeking());
  const auto status =
      std::get<ServerStatus>(simulation.reply({.command = Command::Seek, .place = position + 24h}));
  EXPECT_TRUE(status.isSeeking);
  simulation.reply({.command = Command::Seek, .place = 10s});
  _queue.run();
  EXPECT_FALSE(std::get<ServerStatus>(simulation.reply({})).isSeeking);
}

}  // namespace
}  // namespace varnel
