#include "programs/varnel-telephonyd/sources/PortChooser.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "host/EventLoopQueue.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"
#include "tests/support/PtyModem.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;

// Folders like those of a system with udev.
class FakeDevices {
 public:
  FakeDevices() { fs::create_directories(folders().devices); }
  DeviceFolders folders() const {
    return {.classes = _folder.path() / "class",
            .properties = _folder.path() / "udev",
            .devices = _folder.path() / "dev"};
  }
  std::string device(const std::string& name) const { return (folders().devices / name).string(); }
  void add(const std::string& deviceClass, const std::string& name, const std::string& number,
           const std::string& properties) const {
    fs::create_directories(folders().classes / deviceClass / name);
    fs::create_directories(folders().properties);
    std::ofstream(folders().classes / deviceClass / name / "dev") << number << '\n';
    std::ofstream(folders().properties / ("c" + number)) << properties;
  }

 private:
  TemporaryFolder _folder;
};

TEST(MarkedPorts, AreThoseThatUdevMarksAsAModems) {
  const FakeDevices devices;
  devices.add("tty", "ttyUSB1", "188:1", "I:17\nE:ID_BUS=usb\nE:VARNEL_MODEM=1\nG:systemd\n");
  devices.add("tty", "ttyUSB0", "188:0", "E:VARNEL_MODEM=1\n");
  devices.add("tty", "ttyACM0", "166:0", "E:ID_BUS=usb\nE:VARNEL_MODEM=0\n");
  devices.add("wwan", "wwan0p3", "240:3", "E:VARNEL_MODEM=1\n");
  fs::create_directories(devices.folders().classes / "wwan" / "wwan0");  // is no device
  fs::create_directories(devices.folders().classes / "tty" / "tty0");
  EXPECT_THAT(markedPorts(devices.folders()),
              ElementsAre(devices.device("ttyUSB0"), devices.device("ttyUSB1"), devices.device("wwan0p3")));
}

TEST(MarkedPorts, AreSortedByTheirNumbers) {
  const FakeDevices devices;
  for (const char* number : {"10", "2", "1", "12", "0"})
    devices.add("tty", std::string("ttyUSB") + number, std::string("188:") + number, "E:VARNEL_MODEM=1\n");
  devices.add("tty", "ttyACM3", "166:3", "E:VARNEL_MODEM=1\n");
  EXPECT_THAT(markedPorts(devices.folders()),
              ElementsAre(devices.device("ttyACM3"), devices.device("ttyUSB0"), devices.device("ttyUSB1"),
                          devices.device("ttyUSB2"), devices.device("ttyUSB10"), devices.device("ttyUSB12")));
}

TEST(MarkedPorts, WithoutUdevThereAreNone) {
  const FakeDevices devices;
  EXPECT_THAT(markedPorts(devices.folders()), IsEmpty());
}

TEST(LastingName, IsTheLinkThatUdevMakes) {
  const FakeDevices devices;
  std::ofstream(devices.device("ttyUSB0")) << "";
  EXPECT_EQ(lastingNameOf(devices.device("ttyUSB0"), devices.folders()), devices.device("ttyUSB0"));
  const fs::path links = devices.folders().devices / "serial" / "by-id";
  fs::create_directories(links);
  fs::create_symlink("../../ttyUSB1", links / "usb-other");
  fs::create_symlink("../../ttyUSB0", links / "usb-modem");
  EXPECT_EQ(lastingNameOf(devices.device("ttyUSB0"), devices.folders()), (links / "usb-modem").string());
  EXPECT_EQ(lastingNameOf("/dev/no-such-device", devices.folders()), "/dev/no-such-device");
}

// There is no system bus here.
class PortChooserTest : public testing::Test {
 protected:
  PortChooserTest() { ::setenv("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/dev/no-such-bus", 1); }
  void search() {
    _chooser.search([this](const std::optional<std::string>& path) {
      _hasEnded = true;
      _found = path;
    });
    EXPECT_TRUE(runUntil([this] { return _hasEnded; }));
  }

  FakeDevices _devices;
  EventLoopQueue _queue;
  std::vector<std::string> _told;
  bool _hasEnded = false;
  std::optional<std::string> _found;
  PortChooser _chooser{{.queue = _queue,
                        .tell = [this](const std::string& sentence) { _told.push_back(sentence); },
                        .folders = _devices.folders()}};
};

TEST_F(PortChooserTest, WithoutModemManagerItAsksWhatUdevMarks) {
  PtyModem modem(_devices.device("ttyUSB1"));
  _devices.add("tty", "ttyUSB0", "188:0", "E:VARNEL_MODEM=1\n");
  _devices.add("tty", "ttyUSB1", "188:1", "E:VARNEL_MODEM=1\n");
  search();
  EXPECT_EQ(_found, _devices.device("ttyUSB1"));
  EXPECT_THAT(_told,
              ElementsAre(testing::StartsWith("there is no device " + _devices.device("ttyUSB0") + "; ")));
}

TEST_F(PortChooserTest, SaysWhatToDoWhenNothingIsMarked) {
  search();
  EXPECT_EQ(_found, std::nullopt);
  EXPECT_THAT(_told,
              ElementsAre("ModemManager does not run, and udev marks no port as a modem's; plug the modem "
                          "in, or name its port with --port DEVICE"));
}

TEST_F(PortChooserTest, SaysWhatToDoWhenNoMarkedPortIsFree) {
  _devices.add("tty", "ttyUSB0", "188:0", "E:VARNEL_MODEM=1\n");
  search();
  EXPECT_EQ(_found, std::nullopt);
  ASSERT_EQ(_told.size(), 2u);
  EXPECT_EQ(_told[1],
            "no port of a modem is a diagnostic port that is free; name another one with --port DEVICE");
}

TEST_F(PortChooserTest, WithoutModemManagerThereIsNothingToInhibit) {
  _chooser.inhibitModemOf("/dev/ttyUSB0");
  EXPECT_THAT(_told,
              ElementsAre("ModemManager does not use the modem of /dev/ttyUSB0, so --inhibit does nothing"));
}

}  // namespace
}  // namespace varnel
