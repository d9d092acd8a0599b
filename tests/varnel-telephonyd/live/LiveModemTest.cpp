#include "programs/varnel-telephonyd/live/LiveModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <malloc.h>

#include <QCoreApplication>
#include <QEvent>
#include <QTcpServer>
#include <QTcpSocket>
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <limits>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "base/PropertyList.h"
#include "host/EventLoopQueue.h"
#include "tests/support/Describe.h"
#include "tests/support/EventLoop.h"
#include "tests/support/MockModemManager.h"
#include "tests/support/PrivateBus.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

constexpr std::uint32_t simFiles = 0xFF0000, cellMonitor = 0xFF0001, packetData = 0xFF0002,
                        modemReport = 0xFF0003;

std::chrono::milliseconds now() {
  return std::chrono::duration_cast<std::chrono::milliseconds>(
      std::chrono::steady_clock::now().time_since_epoch());
}

// A viewer's stream, of which each last packet is known by its code.
class Viewer {
 public:
  explicit Viewer(LiveModem& modem) : _source(modem.makeSource()) {
    _source->setNewsHandler([this] { take(); });
    take();
  }
  std::string last(std::uint32_t code) const {
    const auto found = _last.find(code);
    return found == _last.end() ? "nothing" : found->second;
  }
  std::size_t count(std::uint32_t code) const {
    const auto found = _counts.find(code);
    return found == _counts.end() ? 0 : found->second;
  }
  std::string note() const { return _source->waitNote(); }

 private:
  void take() {
    while (const auto message = _source->next()) {
      constexpr std::size_t headerSize = 13;
      ASSERT_GE(message->bytes.size(), headerSize);
      EXPECT_EQ(message->bytes[0], 0xFF);
      const std::uint32_t code = 0xFF0000U + message->bytes[3] + 256U * message->bytes[4];
      const auto payload = readPropertyList(ByteView(message->bytes).subspan(headerSize));
      ASSERT_TRUE(payload);
      _last[code] = described(*payload);
      ++_counts[code];
    }
  }

  std::map<std::uint32_t, std::string> _last;
  std::map<std::uint32_t, std::size_t> _counts;
  std::unique_ptr<MessageSource> _source;
};

class LiveModemTest : public testing::Test {
 protected:
  LiveModemTest() {
    ::setenv("DBUS_SYSTEM_BUS_ADDRESS", bus().address().c_str(), 1);
    EXPECT_TRUE(bus().start()) << "dbus-daemon cannot be started";
    EXPECT_TRUE(_positionService.listen(QHostAddress::LocalHost));
  }
  ~LiveModemTest() override { bus().stop(); }

  // A process can have only one address of the system bus.
  static PrivateBus& bus() {
    static PrivateBus only;
    return only;
  }

  enum class Positions { AreNotTold, AreTold };
  void makeLive(const std::string& wanted = {}, Positions positions = Positions::AreNotTold,
                std::chrono::milliseconds answerPatience = 10s,
                const std::function<std::chrono::milliseconds()>& uptime = now) {
    _live = std::make_unique<LiveModem>(
        LiveModem::Setup{.queue = _queue,
                         .uptime = uptime,
                         .wanted = wanted,
                         .pollInterval = 1s,
                         .answerPatience = answerPatience,
                         .tellsPosition = positions == Positions::AreTold,
                         .positionPort = _positionService.serverPort(),
                         .now =
                             [] {
                               return QDateTime({2026, 11, 22}, {14, 0}, Qt::UTC);
                             },
                         .tell = [this](const std::string& sentence) { _told.push_back(sentence); }});
    _live->start();
  }
  // The service with one modem, and a viewer.
  void startAll(const std::vector<std::string>& actions = {"add", "0"}) {
    _service.start();
    _service.does(actions);
    makeLive();
    _viewer = std::make_unique<Viewer>(*_live);
  }
  testing::AssertionResult shows(std::uint32_t code, const std::string& part) const {
    if (runUntil([&] { return _viewer->last(code).find(part) != std::string::npos; }, 30s))
      return testing::AssertionSuccess();
    return testing::AssertionFailure() << "no " << part << " in " << _viewer->last(code);
  }
  testing::AssertionResult isSo(const std::string& state) const {
    if (runUntil([&] { return _live->state() == state; }, 30s)) return testing::AssertionSuccess();
    return testing::AssertionFailure() << _live->state();
  }

  // Without what the event loop of a program deletes at each turn. That of a test does so only inside a task.
  std::size_t usedMemory() {
    _queue.async([] { QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete); });
    runFor(10ms);
    return ::mallinfo2().uordblks;
  }

  QTcpServer _positionService;  // plays gpsd
  MockModemManager _service{bus().address()};
  EventLoopQueue _queue;
  std::vector<std::string> _told;
  std::unique_ptr<LiveModem> _live;
  std::unique_ptr<Viewer> _viewer;
};

TEST_F(LiveModemTest, ShowsTheCellsOfThreeTechnologiesAndNR) {
  startAll({"add", "0", "then", "cells", "0", "lte", "lte-neighbor", "umts", "umts-neighbor", "gsm",
            "gsm-neighbor", "nr"});
  ASSERT_TRUE(shows(cellMonitor, "Serving"));
  EXPECT_TRUE(shows(
      cellMonitor,
      R"({RadioAccessTechnology: "LTE", CellType: "Serving", MCC: 262, MNC: 1, TrackingAreaCode: 24090, )"
      R"(CellIdentity: 30585796, BandInfo: 66, UARFCN: 66986, PhysicalCellIdentity: 426})"));
  EXPECT_TRUE(shows(cellMonitor, R"({RadioAccessTechnology: "LTE", CellType: "Neighbor", BandInfo: 20, )"
                                 R"(UARFCN: 6300, PhysicalCellIdentity: 11})"));
  EXPECT_TRUE(shows(
      cellMonitor,
      R"({RadioAccessTechnology: "UMTS", CellType: "Serving", MCC: 310, MNC: 260, LAC: 65533, )"
      R"(CellIdentity: 169552957, BandInfo: 1, UARFCN: 10562, ScramblingCode: 511, RSCP: -81, EcN0: -8})"));
  EXPECT_TRUE(shows(cellMonitor, R"({RadioAccessTechnology: "UMTS", CellType: "Neighbor", BandInfo: 1, )"
                                 R"(UARFCN: 10587, ScramblingCode: 17, RSCP: 32767, EcN0: 32767})"));
  EXPECT_TRUE(shows(cellMonitor, R"({RadioAccessTechnology: "GSM", CellType: "Serving", MCC: 262, MNC: 1, )"
                                 R"(LAC: 6699, CellIdentity: 15437, ARFCN: 62, RSSI: -35})"));
  EXPECT_TRUE(
      shows(cellMonitor, R"({RadioAccessTechnology: "GSM", CellType: "Neighbor", ARFCN: 975, RSSI: -55})"));
  EXPECT_THAT(_viewer->last(cellMonitor), Not(HasSubstr("NR")));
  EXPECT_TRUE(shows(
      modemReport,
      R"({RadioAccessTechnology: "NR", CellType: "Serving", PLMN: "26201", TrackingAreaCode: 11259375, )"
      R"(CellIdentity: 65016260489, NR-ARFCN: 632628, PhysicalCellIdentity: 999, RSRP: -88.0000, )"
      R"(RSRQ: -11.0000, SINR: 17.5000})"));
  EXPECT_TRUE(
      shows(modemReport, R"(EARFCN: 6300, PhysicalCellIdentity: 11, RSRP: -101.000, RSRQ: -14.0000})"));
  EXPECT_TRUE(shows(modemReport, R"(UARFCN: 10562, ScramblingCode: 511, RSCP: -81.0000, EcIo: -7.50000, )"
                                 R"(PathLoss: 111.000})"));
  EXPECT_TRUE(shows(modemReport, R"(ARFCN: 975, BaseStationIdentityCode: 1, RSSI: -110.000})"));
  EXPECT_TRUE(shows(modemReport, R"({Version: 1, RegistrationState: 1, Operator: "Test Net", PLMN: "26201", )"
                                 R"(AccessTechnologies: ["LTE"], SignalQuality: 71, Cells: [)"));
}

TEST_F(LiveModemTest, LevelsComeAsTheyAreSignaled) {
  startAll({"add", "0", "then", "cells", "0", "lte"});
  ASSERT_TRUE(shows(modemReport, "RSRP: -95.5000"));
  _service.does({"change", "0", "Signal", "Lte={'rsrp': -90.0, 'rssi': -60.0, 'snr': 12.5}"});
  EXPECT_TRUE(shows(modemReport, "RSRP: -90.0000, RSRQ: -10.5000, SINR: 12.5000, RSSI: -60.0000}"));
  EXPECT_TRUE(shows(cellMonitor, "PhysicalCellIdentity: 426, RSSI: -60}"));
  _service.does({"change", "0", "Signal", "Lte={}", "Nr5g={'rsrp': -80.0}"});
  EXPECT_TRUE(shows(modemReport, R"({RadioAccessTechnology: "NR", CellType: "Serving", RSRP: -80.0000}])"));
}

TEST_F(LiveModemTest, WithoutTheRightToAskForCellsTheServingCellIsShown) {
  startAll({"add", "0", "then", "cells", "0", "refused"});
  EXPECT_TRUE(shows(cellMonitor, R"([{RadioAccessTechnology: "LTE", CellType: "Serving", MCC: 262, MNC: 1, )"
                                 R"(TrackingAreaCode: 24090, CellIdentity: 30585796}])"));
  ASSERT_TRUE(runUntil([&] { return _told.size() == 2; }));
  EXPECT_THAT(_told,
              ElementsAre("Maker M1 is registered in Test Net",
                          "ModemManager tells the neighboring cells only to root; the serving cell is "
                          "shown; section NEIGHBOR CELLS of varnel-telephonyd(8) says how to allow it"));
  runFor(2500ms);
  EXPECT_EQ(_told.size(), 2u) << _told.back();
}

TEST_F(LiveModemTest, CellsThatWereRefusedAreNotAskedForAgain) {
  startAll({"add", "0", "then", "cells", "0", "slowly-refused"});
  const auto count = [&](const std::string& method) {
    const std::string calls = _service.calls(), part = ' ' + method + '\n';
    std::size_t found = 0;
    for (std::size_t at = calls.find(part); at != std::string::npos; at = calls.find(part, at + 1)) ++found;
    return found;
  };
  ASSERT_TRUE(runUntil([&] { return count("GetCellInfo") == 1; }));
  _viewer.reset();  // before the answer
  ASSERT_TRUE(runUntil([&] { return _told.size() == 2; }));
  _viewer = std::make_unique<Viewer>(*_live);
  ASSERT_TRUE(runUntil([&] { return count("GetLocation") == 2; }));
  EXPECT_EQ(count("GetCellInfo"), 1u);
}

TEST_F(LiveModemTest, AnErrorShowsNoOldCells) {
  startAll({"add", "0", "then", "cells", "0", "gsm-neighbor"});
  ASSERT_TRUE(shows(cellMonitor, "ARFCN: 975"));
  _service.does({"cells", "0", "failed"});
  ASSERT_TRUE(runUntil([&] { return _viewer->last(cellMonitor).find("ARFCN: 975") == std::string::npos; }));
  _service.does({"cells", "0", "gsm-neighbor"});
  EXPECT_TRUE(shows(cellMonitor, "ARFCN: 975"));
}

TEST_F(LiveModemTest, WithoutAnAnswerThereAreNoOldCells) {
  _service.start();
  _service.does({"add", "0", "then", "cells", "0", "gsm-neighbor"});
  makeLive("", Positions::AreNotTold, 2s);
  _viewer = std::make_unique<Viewer>(*_live);
  ASSERT_TRUE(shows(cellMonitor, "ARFCN: 975"));
  _service.does({"cells", "0", "silent"});
  EXPECT_TRUE(runUntil([&] { return _viewer->last(cellMonitor).find("ARFCN: 975") == std::string::npos; }));
}

TEST_F(LiveModemTest, TakesOnlyWhatIsOfItsKindAndInItsRange) {
  startAll({"add", "0", "then", "location", "0", "{}", "then", "cells", "0", "lies", "nr"});
  EXPECT_TRUE(shows(modemReport, R"({RadioAccessTechnology: "LTE", CellType: "Neighbor"}, )"
                                 R"({RadioAccessTechnology: "NR", CellType: "Serving", PLMN: "26201", )"));
  EXPECT_EQ(_viewer->last(cellMonitor), "[]");
}

TEST_F(LiveModemTest, ShowsCardAndConnections) {
  startAll({"card", "8949000000000000001", "then", "bearer", "4", "then", "add", "0"});
  EXPECT_TRUE(shows(simFiles, R"({kSimFile_ICCID: "8949000000000000001", kSimFile_MSISDN: "+15550100"})"));
  EXPECT_TRUE(shows(
      packetData,
      R"([{APN: "internet.example", State: "Active", Type: "IPv4v6", Purpose: "default", Interface: "wwan0", )"
      R"(Profile: "3", Address: "192.0.2.10/30", Gateway: "192.0.2.9", DNS: "198.51.100.1, 198.51.100.2", )"
      R"(MTU: "1500", IPv6 Address: "2001:db8::10/64", IPv6 Gateway: "2001:db8::1", )"
      R"(Downlink Rate: "150000000 bit/s", Bytes Sent: "7", Bytes Received: "5000000000", )"
      R"(Duration: "61 s"}])"));
  EXPECT_THAT(_viewer->last(packetData), Not(HasSubstr("secret")));
  _service.does({"received", "4", "6000000000"});
  EXPECT_TRUE(shows(packetData, R"(Bytes Received: "6000000000")"));
  _service.does({"change", "0", "Modem", "Bearers=dbus.Array([], signature='o')"});
  EXPECT_TRUE(shows(packetData, "[]"));
  // Empty texts empty the rows.
  _service.does({"change", "0", "Modem", "Sim=dbus.ObjectPath('/')"});
  EXPECT_TRUE(shows(simFiles, R"({kSimFile_ICCID: "", kSimFile_MSISDN: "+15550100"})"));
  _service.does({"remove", "0"});
  EXPECT_TRUE(shows(simFiles, R"({kSimFile_ICCID: "", kSimFile_MSISDN: ""})"));
}

TEST_F(LiveModemTest, AModemThatHasGoneLeavesNothingBehind) {
  startAll({"card", "8949", "then", "bearer", "4", "then", "add", "0", "then", "cells", "0", "lte"});
  ASSERT_TRUE(shows(cellMonitor, "LTE"));
  ASSERT_TRUE(shows(packetData, "internet.example"));
  ASSERT_TRUE(shows(simFiles, "8949"));
  _service.does({"remove", "0"});
  EXPECT_TRUE(shows(modemReport, "{Version: 1}"));
  EXPECT_EQ(_viewer->last(cellMonitor), "[]");
  EXPECT_EQ(_viewer->last(packetData), "[]");
  EXPECT_EQ(_viewer->last(simFiles), R"({kSimFile_ICCID: "", kSimFile_MSISDN: ""})");
}

// A device behind many hubs.
TEST_F(LiveModemTest, TheDeviceOfAModemMayHaveALongPath) {
  const std::string device = "/sys/devices/" + std::string(200, 'a') + "/usb1/1-";
  _service.start();
  _service.does({"add", "0", "8", device + "1", "then", "add", "1", "8", device + "2"});
  makeLive(device + "2");
  _viewer = std::make_unique<Viewer>(*_live);
  EXPECT_TRUE(shows(modemReport, "Test Net"));
  EXPECT_EQ(_live->path(), "/org/freedesktop/ModemManager1/Modem/1");
}

// An older service may tell none.
TEST_F(LiveModemTest, AModemNeedsNoDevice) {
  startAll({"add", "0", "8", ""});
  EXPECT_TRUE(shows(modemReport, "Test Net"));
}

// Where the modem's receiver says that it is.
const char* const ownPosition =
    "{dbus.UInt32(2): dbus.Dictionary({'utc-time': '120000', 'latitude': 52.5, 'longitude': -13.25, "
    "'altitude': 34.0}, "
    "signature='sv')}";

TEST_F(LiveModemTest, NobodyIsAskedForAPositionThatNobodyWants) {
  startAll({"add", "0", "then", "location", "0", ownPosition});
  ASSERT_TRUE(shows(modemReport, "Test Net"));
  runFor(1500ms);
  EXPECT_THAT(_viewer->last(modemReport), Not(HasSubstr("Position")));
  EXPECT_FALSE(_positionService.hasPendingConnections());
}

TEST_F(LiveModemTest, ThePositionIsThatOfTheModemElseThatOfTheService) {
  _service.start();
  _service.does({"add", "0", "then", "location", "0", ownPosition});
  makeLive("", Positions::AreTold);
  _viewer = std::make_unique<Viewer>(*_live);
  EXPECT_TRUE(shows(modemReport, R"(Position: {Latitude: 52.5000, Longitude: -13.2500, Altitude: 34.0000, )"
                                 R"(Time: date 817041600s 0us, Source: "GNSS"}})"));
  ASSERT_TRUE(runUntil([&] { return _positionService.hasPendingConnections(); }));
  const std::unique_ptr<QTcpSocket> connection(_positionService.nextPendingConnection());
  connection->write("{\"class\":\"TPV\",\"mode\":2,\"lat\":1.5,\"lon\":2.5}\n");
  connection->flush();
  // Its receiver has no fix any more.
  _service.does({"location", "0", "{dbus.UInt32(1): ''}"});
  EXPECT_TRUE(shows(modemReport, R"(Position: {Latitude: 1.50000, Longitude: 2.50000, Source: "gpsd"}})"));
}

// A receiver that has lost its fix repeats its last one.
TEST_F(LiveModemTest, APositionThatIsNotNewIsForgotten) {
  _service.start();
  _service.does({"add", "0", "then", "location", "0", ownPosition});
  std::chrono::milliseconds later = 0ms;
  _live = std::make_unique<LiveModem>(LiveModem::Setup{.queue = _queue,
                                                       .uptime = [&] { return now() + later; },
                                                       .pollInterval = 1s,
                                                       .tellsPosition = true,
                                                       .positionPort = _positionService.serverPort(),
                                                       .tell = [](const std::string&) {}});
  _live->start();
  _viewer = std::make_unique<Viewer>(*_live);
  ASSERT_TRUE(shows(modemReport, "Position"));
  later = 16s;
  EXPECT_TRUE(runUntil([&] { return _viewer->last(modemReport).find("Position") == std::string::npos; }));
}

TEST_F(LiveModemTest, AViewerThatComesLaterSeesWhatHasNotChanged) {
  startAll({"card", "8949", "then", "add", "0", "then", "cells", "0", "nr"});
  ASSERT_TRUE(shows(modemReport, "NR-ARFCN: 632628"));
  ASSERT_TRUE(shows(simFiles, "8949"));
  const Viewer second(*_live);
  EXPECT_THAT(second.last(modemReport), HasSubstr("NR-ARFCN: 632628"));
  EXPECT_THAT(second.last(simFiles), HasSubstr("8949"));
}

TEST_F(LiveModemTest, TheModemIsAskedOnlyWhileThereIsAViewer) {
  startAll({"add", "0", "then", "cells", "0", "lte"});
  ASSERT_TRUE(shows(modemReport, "EARFCN: 66986"));
  ASSERT_TRUE(runUntil([&] { return _service.calls().find(" Setup 1\n") != std::string::npos; }));
  _viewer.reset();
  EXPECT_TRUE(runUntil([&] { return _service.calls().find(" Setup 0\n") != std::string::npos; }));
  const std::string before = _service.calls();
  runFor(2500ms);
  EXPECT_EQ(_service.calls(), before);
}

TEST_F(LiveModemTest, AViewerThatComesAfterAllOthersSeesNoOldCells) {
  startAll({"add", "0", "then", "cells", "0", "gsm-neighbor"});
  ASSERT_TRUE(shows(modemReport, "ARFCN: 975"));
  const std::uint64_t before = _live->sent();
  _viewer.reset();
  ASSERT_TRUE(runUntil([&] { return _live->sent() > before; }));
  const Viewer later(*_live);
  EXPECT_THAT(later.last(modemReport), AllOf(HasSubstr("Test Net"), Not(HasSubstr("ARFCN: 975"))));
}

TEST_F(LiveModemTest, AtTheEndTheModemHasItsOldRate) {
  startAll();
  ASSERT_TRUE(runUntil([&] { return _service.calls().find(" Setup 1\n") != std::string::npos; }));
  runFor(100ms);
  bool hasEnded = false;
  _live->end([&] { hasEnded = true; });
  EXPECT_TRUE(runUntil([&] { return hasEnded; }));
  EXPECT_THAT(_service.calls(), HasSubstr(" Setup 0\n"));
}

TEST_F(LiveModemTest, AtTheEndARateThatHasNoAnswerYetIsRestoredToo) {
  startAll({"add", "0", "then", "rate", "0", "slow"});
  ASSERT_TRUE(runUntil([&] { return _service.calls().find(" Setup 1\n") != std::string::npos; }));
  std::string callsAtEnd;
  _live->end([&] { callsAtEnd = _service.calls(); });
  EXPECT_EQ(callsAtEnd, "");
  EXPECT_TRUE(runUntil([&] { return !callsAtEnd.empty(); }));
  EXPECT_THAT(callsAtEnd, HasSubstr(" Setup 0\n"));
}

TEST_F(LiveModemTest, ARateThatIsRefusedIsToldOnce) {
  startAll({"add", "0", "then", "rate", "0", "refused"});
  EXPECT_TRUE(runUntil([&] { return _told.size() >= 2; }));
  EXPECT_THAT(_told, Contains("ModemManager does not let this user ask for levels; section AS A SERVICE of "
                              "varnel-telephonyd(8) has a rule of polkit"));
}

TEST_F(LiveModemTest, ARateThatFailsOnceIsAskedForAgain) {
  _service.start();
  _service.does({"add", "0", "then", "rate", "0", "failed"});
  std::chrono::milliseconds later = 0ms;
  makeLive({}, Positions::AreNotTold, 10s, [&] { return now() + later; });
  _viewer = std::make_unique<Viewer>(*_live);
  ASSERT_TRUE(runUntil([&] { return _told.size() == 2; }));
  EXPECT_EQ(_told[1],
            "Maker M1 does not tell its levels to ModemManager now; the server asks again every minute");
  _service.does({"rate", "0"});
  const std::string before = _service.calls();
  later = 61s;
  EXPECT_TRUE(
      runUntil([&] { return _service.calls().find(" Setup 1\n", before.size()) != std::string::npos; }));
  bool hasEnded = false;
  runFor(100ms);
  _live->end([&] { hasEnded = true; });
  EXPECT_TRUE(runUntil([&] { return hasEnded; }));
  EXPECT_THAT(_service.calls(), HasSubstr(" Setup 0\n"));
}

TEST_F(LiveModemTest, EachStateOfAModemHasOneSentence) {
  _service.start();
  makeLive();
  _viewer = std::make_unique<Viewer>(*_live);
  EXPECT_TRUE(isSo("ModemManager knows no modem; plug one in"));
  _service.does({"add", "2", "2"});
  EXPECT_TRUE(isSo("Maker M1 is locked by the SIM card's PIN; type mmcli -i any --pin=PIN"));
  EXPECT_EQ(_viewer->note(), _live->state());
  _service.does({"change", "2", "Modem", "State=dbus.Int32(3)"});
  EXPECT_TRUE(isSo("Maker M1 is disabled; type mmcli -m 2 --enable"));
  _service.does({"change", "2", "Modem", "State=dbus.Int32(7)"});
  EXPECT_TRUE(isSo("Maker M1 searches a network"));
  _service.does({"change", "2", "Modem", "State=dbus.Int32(11)"});
  EXPECT_TRUE(isSo("Maker M1 is connected in Test Net"));
  EXPECT_EQ(_viewer->note(), "");
  _service.does({"change", "2", "Modem", "State=dbus.Int32(-1)"});
  EXPECT_TRUE(isSo("Maker M1 has no SIM card; put one in"));
  _service.does({"remove", "2"});
  EXPECT_TRUE(isSo("Maker M1 has gone; plug it in again"));
  EXPECT_TRUE(shows(modemReport, "{Version: 1}"));
  EXPECT_EQ(_told.size(), 7u);
}

TEST_F(LiveModemTest, AModemThatIsPluggedInAgainIsTheSameUnderAnotherNumber) {
  _service.start();
  _service.does({"add", "0", "8", "/sys/a", "then", "add", "1", "8", "/sys/b"});
  makeLive("1");
  EXPECT_TRUE(isSo("Maker M1 is registered in Test Net"));
  EXPECT_EQ(_live->path(), "/org/freedesktop/ModemManager1/Modem/1");
  _service.does({"remove", "1"});
  EXPECT_TRUE(isSo("Maker M1 has gone; plug it in again"));
  _service.does({"add", "7", "8", "/sys/b"});
  EXPECT_TRUE(isSo("Maker M1 is registered in Test Net"));
  EXPECT_EQ(_live->path(), "/org/freedesktop/ModemManager1/Modem/7");
}

TEST_F(LiveModemTest, AModemCanBeNamedByItsPathOrItsDevice) {
  _service.start();
  _service.does({"add", "0", "8", "/sys/a", "then", "add", "10", "8", "/sys/b", "then", "add", "9"});
  makeLive("/sys/b");
  EXPECT_TRUE(runUntil([&] { return _live->path() == "/org/freedesktop/ModemManager1/Modem/10"; }));
  makeLive("/org/freedesktop/ModemManager1/Modem/9");
  EXPECT_TRUE(runUntil([&] { return _live->path() == "/org/freedesktop/ModemManager1/Modem/9"; }));
  makeLive("5");
  EXPECT_TRUE(isSo("ModemManager knows no modem 5; mmcli -L lists its modems"));
}

TEST_F(LiveModemTest, WithoutABusItWaitsForOne) {
  bus().stop();
  makeLive();
  EXPECT_TRUE(isSo("the system bus cannot be reached, so ModemManager cannot be asked"));
  EXPECT_TRUE(bus().start());
  EXPECT_TRUE(isSo("ModemManager does not run; type sudo systemctl start ModemManager"));
  bus().stop();
  EXPECT_TRUE(isSo("the system bus cannot be reached, so ModemManager cannot be asked"));
}

// The event loop, and so what finds the bus, runs only while a test waits for the live modem.
TEST_F(LiveModemTest, ABusThatIsBackWithTheServiceHasIt) {
  startAll();
  ASSERT_TRUE(isSo("Maker M1 is registered in Test Net"));
  bus().stop();
  ASSERT_TRUE(isSo("the system bus cannot be reached, so ModemManager cannot be asked"));
  _service.stop();
  ASSERT_TRUE(bus().start());
  _service.start();
  _service.does({"add", "0"});
  EXPECT_TRUE(isSo("Maker M1 is registered in Test Net"));
  EXPECT_THAT(_told, ElementsAre("Maker M1 is registered in Test Net",
                                 "the system bus cannot be reached, so ModemManager cannot be asked",
                                 "Maker M1 is registered in Test Net"));
}

// LiveEndToEndTest makes more, with the real service.
constexpr int rounds = 20;

// The least memory of the last rounds, and the most of the first ones: what a round holds for a moment counts
// for neither. The very first rounds make what stays.
struct MemoryOfRounds {
  void note(int round, std::size_t used) {
    if (round < rounds / 4) return;
    if (round < rounds / 2) early = std::max(early, used);
    if (round >= rounds * 3 / 4) late = std::min(late, used);
  }
  std::size_t early = 0, late = std::numeric_limits<std::size_t>::max();
};

std::size_t openFiles() {
  const std::filesystem::directory_iterator files("/proc/self/fd");
  return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

TEST_F(LiveModemTest, AModemThatComesAndGoesIsAlwaysBack) {
  startAll({"add", "0", "then", "cells", "0", "lte"});
  ASSERT_TRUE(shows(modemReport, "EARFCN: 66986"));
  std::size_t files = 0;
  MemoryOfRounds memory;
  for (int round = 0; round < rounds; ++round) {
    _service.does({"remove", "0"});
    ASSERT_TRUE(isSo("Maker M1 has gone; plug it in again")) << round;
    ASSERT_TRUE(runUntil([&] { return _viewer->last(modemReport) == "{Version: 1}"; })) << round;
    _service.does({"add", "0", "then", "cells", "0", "lte"});
    ASSERT_TRUE(shows(modemReport, "EARFCN: 66986")) << round;
    memory.note(round, usedMemory());
    if (round == rounds / 4) files = openFiles();
  }
  EXPECT_LE(openFiles(), files);
  EXPECT_LE(memory.late, memory.early + 10'000);
}

TEST_F(LiveModemTest, AServiceThatIsStoppedAndStartedIsAlwaysBack) {
  startAll({"add", "0", "then", "cells", "0", "lte"});
  std::size_t files = 0;
  MemoryOfRounds memory;
  for (int round = 0; round < rounds; ++round) {
    ASSERT_TRUE(shows(modemReport, "EARFCN: 66986")) << round;
    memory.note(round, usedMemory());
    if (round == rounds / 4) files = openFiles();
    _service.stop();
    ASSERT_TRUE(isSo("ModemManager does not run; type sudo systemctl start ModemManager")) << round;
    ASSERT_TRUE(runUntil([&] { return _viewer->last(modemReport) == "{Version: 1}"; })) << round;
    _service.start();
    _service.does({"add", "0", "then", "cells", "0", "lte"});
  }
  EXPECT_TRUE(shows(modemReport, "EARFCN: 66986"));
  EXPECT_LE(openFiles(), files);
  EXPECT_LE(memory.late, memory.early + 10'000);
}

}  // namespace
}  // namespace varnel
