#include "programs/varnel-telephonyd/sources/PortSearch.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <string>
#include <vector>

#include "tests/support/FakeQueue.h"
#include "tests/support/MemoryDevice.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class PortSearchTest : public testing::Test {
 protected:
  void search(std::vector<std::string> candidates) {
    _search = std::make_unique<PortSearch>(PortSearch::Setup{
        .queue = _queue,
        .candidates = std::move(candidates),
        .makeDevice =
            [this](const std::string& path) { return std::make_unique<MemoryPortDevice>(_devices[path]); },
        .prepare =
            [this](const std::string& path) {
              _prepared.push_back(path);
              return path == _unprepared ? std::optional<std::string>("not prepared") : std::nullopt;
            },
        .ended =
            [this](const std::optional<std::string>& path) {
              ++_ends;
              _found = path;
            },
        .tell = [this](const std::string& sentence) { _told.push_back(sentence); }});
    _search->begin();
    run();
  }
  void run() {
    for (int i = 0; i < 20; ++i) {
      for (auto& [path, device] : _devices) device.run();
      _queue.run();
    }
  }
  void advance(std::chrono::milliseconds duration) {
    for (auto passed = 0ms; passed < duration; passed += 500ms) {
      _queue.advance(500ms);
      run();
    }
  }
  // A device behind which nothing answers.
  void makeSilent(const std::string& path) { _devices[path].modem.otherAnswers = {{{}, {}}}; }

  FakeQueue _queue;
  std::map<std::string, MemoryDevice> _devices;
  std::vector<std::string> _prepared, _told;
  std::string _unprepared;
  int _ends = 0;
  std::optional<std::string> _found;
  std::unique_ptr<PortSearch> _search;
};

TEST_F(PortSearchTest, TheFirstDiagnosticPortIsTakenAndIsClosedAgain) {
  search({"/dev/a", "/dev/b"});
  EXPECT_EQ(_found, "/dev/a");
  EXPECT_EQ(_ends, 1);
  EXPECT_FALSE(_devices["/dev/a"].isOpen);
  EXPECT_THAT(_prepared, ElementsAre("/dev/a"));
  EXPECT_THAT(_told, IsEmpty());
  EXPECT_EQ(_devices["/dev/b"].openings, 0);
}

TEST_F(PortSearchTest, WhatIsBusyOrSilentIsToldAndTheNextOneIsAsked) {
  _devices["/dev/a"].trouble = "a is busy";
  makeSilent("/dev/b");
  _unprepared = "/dev/c";
  search({"/dev/a", "/dev/b", "/dev/c", "/dev/d"});
  EXPECT_EQ(_ends, 0);
  advance(5s);
  EXPECT_EQ(_found, "/dev/d");
  EXPECT_EQ(_ends, 1);
  EXPECT_THAT(_told,
              ElementsAre("a is busy", testing::StartsWith("/dev/b does not answer as a diagnostic port"),
                          "not prepared"));
  EXPECT_FALSE(_devices["/dev/b"].isOpen);
  EXPECT_EQ(_devices["/dev/c"].openings, 0);
}

TEST_F(PortSearchTest, WithoutACandidateThatIsOneNothingIsFound) {
  makeSilent("/dev/a");
  search({"/dev/a"});
  advance(5s);
  EXPECT_EQ(_found, std::nullopt);
  EXPECT_EQ(_ends, 1);
  EXPECT_FALSE(_devices["/dev/a"].isOpen);
}

TEST_F(PortSearchTest, ADeviceThatIsUnpluggedMeanwhileIsPassedOver) {
  makeSilent("/dev/a");
  search({"/dev/a", "/dev/b"});
  _devices["/dev/a"].unplug();
  run();
  EXPECT_EQ(_found, "/dev/b");
  EXPECT_THAT(_told, ElementsAre("/dev/a is unplugged; plug it in again, and the display goes on"));
}

TEST_F(PortSearchTest, MayEndEarly) {
  makeSilent("/dev/a");
  search({"/dev/a"});
  _search.reset();
  advance(5s);
  EXPECT_EQ(_ends, 0);
}

}  // namespace
}  // namespace varnel
