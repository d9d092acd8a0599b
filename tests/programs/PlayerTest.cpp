#include "programs/varnel/Player.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <QAction>
#include <QDropEvent>
#include <QMenu>
#include <QMimeData>
#include <QUrl>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "app/RowAnswers.h"
#include "app/Snapshot.h"
#include "base/PropertyList.h"
#include "host/CaptureWriter.h"
#include "programs/varnel/CaptureCourses.h"
#include "programs/varnel/CaptureHistory.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/EventLoop.h"
#include "tests/support/Process.h"
#include "tests/support/TestWidgets.h"
#include "widgets/AlertWidget.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using Texts = std::vector<std::string>;

constexpr const char* section = "Serving Cell Info";

// The application with its window in this process, and real servers, which it starts itself.
class PlayerTest : public testing::Test {
 protected:
  PlayerTest() {
    ::setenv("XDG_RUNTIME_DIR", _session.path().c_str(), 1);
    ::setenv("PATH", fs::path(VARNEL_TELEPHONYD_PROGRAM).parent_path().c_str(), 1);
    ::setenv("TZ", "UTC", 1);
    _options.deviceRoot = _device.path().string();
    _services.emplace(_options, _application);
    _answers.emplace(_services->model().generator.resources, _services->playedClock(), _history);
    _courses.emplace(CaptureCourses::Sources{_history, _services->playedClock(), [this] {
                                               return _whole ? std::optional(CaptureCourses::Capture{
                                                                   &_whole->numbers(), !_whole->isReading()})
                                                             : std::nullopt;
                                             }});
    _app.emplace(VarnelApp::Host{.model = _services->model(),
                                 .files = _services->files(),
                                 .preferences = _services->preferences(),
                                 .userInterface = _userInterface,
                                 .history = &_history,
                                 .answers = &*_answers,
                                 .courses = &*_courses,
                                 .usersClock = &_services->clock()});
    _player.emplace(
        Player::Parts{*_services, *_app, _userInterface, _options, {}, [this](const Player::Saved& saved) {
                        _saved.push_back(saved);
                      }});
    _userInterface.setWindowObserver([this](WindowWidget& window) { _player->furnish(window); });
  }
  ~PlayerTest() override { _app->applicationWillTerminate(); }

  // A capture with a packet per second, the first of them at 2023-11-14 22:13:20. The LTE technology shows
  // the second, up to 255, as the number of antennas. From second 30 on, the clock may have leapt ahead.
  // After the last value, the packets say something else.
  std::string capture(int seconds, const std::string& name = "walk.pcap", int leap = 0,
                      int lastValue = 1000) const {
    const std::string path = _files.file(name);
    CaptureWriter writer(path, ExistingRecording::Replaced, "kalvi-lte");
    for (int second = 0; second <= seconds; ++second) {
      Bytes message(22, 0);
      message[0] = 1;
      message[1] = 21;
      message[3] = second <= lastValue ? 0xC1 : 0xC3;
      message[4] = 0xB0;
      message[13] = 1;
      message[20] = static_cast<std::uint8_t>(second);
      writer.write({1'700'000'000 + second + (second >= 30 ? leap : 0), 0}, message);
    }
    return path;
  }
  // A snapshot of displays with these values, a second after each other.
  std::string snapshot(const Texts& values) const {
    Value items = Value::ofArray();
    std::int64_t second = 1'700'000'000;
    for (const std::string& value : values) {
      Value display = dictionaryOf({{"Cell", dictionaryOf({{"RSRP", value}})}});
      items.array()->push_back(
          dictionaryOf({{"Date", dateDescription({second++, 0})}, {"Display", std::move(display)}}));
    }
    const auto bytes = writeXmlPropertyList(snapshotContents({second, 0}, items, "on the stairs"));
    const std::string path = _files.file("saved.varnel");
    std::ofstream(path, std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes->data()), static_cast<std::streamsize>(bytes->size()));
    return path;
  }

  void launch(const std::optional<std::string>& file = {}) {
    _options.file = file;
    _app->applicationDidFinishLaunching();
    window().setGeometry(0, 0, 600, 800);
    _player->begin();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window(), patience_ms));
  }
  QAction* command(Qt::Key key) {
    for (QAction* const action : window().actions())
      if (action->shortcuts().contains(QKeySequence(Qt::CTRL | key))) return action;
    return nullptr;
  }
  // As the button of the bar and the command of the window say it.
  Texts waysToClose() {
    return {bar()->closeButton().toolTip().toStdString(), command(Qt::Key_W)->text().toStdString()};
  }
  bool offers(const std::string& text) {
    for (const QAction* const action : window().actions())
      if (action->text().toStdString() == text) return window().offers(*action);
    return false;
  }
  WindowWidget& window() { return static_cast<WindowWidget&>(*_app->window()); }
  PaneWidget& pane() { return window().stack()->topPane(); }
  std::string title() { return pane().header().title().toStdString(); }
  Texts rows() {
    Texts all;
    for (const RowWidget* row : pane().tableWidget().visibleRows())
      all.push_back(row->description().toStdString());
    return all;
  }
  bool hasRow(const std::string& row) { return std::ranges::count(rows(), row) > 0; }
  bool waitForRow(const std::string& row) {
    return runUntil([&] { return hasRow(row); });
  }
  void openRow(const std::string& name) {
    ASSERT_TRUE(waitForRow(name)) << testing::PrintToString(rows());
    _app->goTo({name, "-"});
    _app->goTo({name});
    static_cast<VarnelPaneController&>(*window().stack()->topController()).openRow(name);
    ASSERT_EQ(title(), name);
  }
  // The number of antennas, which is the second of the capture; -1 when it is not shown.
  int secondShown() {
    constexpr std::string_view start = "Num Tx Antennas: ";
    for (const std::string& row : rows())
      if (row.starts_with(start)) return std::atoi(row.c_str() + start.size());
    return -1;
  }
  // What the row of the number shows beside its texts.
  CellFacts factsShown() {
    for (const RowWidget* row : pane().tableWidget().visibleRows())
      if (row->name() == "Num Tx Antennas") return row->facts();
    return {};
  }
  // The moment when it was written, in seconds of the capture.
  std::int64_t secondWritten() {
    const auto* const row =
        dynamic_cast<const VarnelModelLeafNode*>(_app->nodeAt({section, "Num Tx Antennas"}));
    return row && row->writtenAt() ? row->writtenAt()->seconds - 1'700'000'000 : -1;
  }
  void pausePlaying() {
    ASSERT_TRUE(waitForBar([](const auto& state) { return !state.clock.isEmpty() && state.length > 0; }));
    QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
    ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Play; }));
  }
  void jumpTo(int second) {
    Q_EMIT bar()->jumpWanted(second * 1000 + 500);
    ASSERT_TRUE(waitForBar([&](const auto& state) { return state.place == second * 1000; })) << barTexts();
    bool isShown = false;
    _services->queue().async([&isShown] { isShown = true; });
    ASSERT_TRUE(runUntil([&isShown] { return isShown; }));
  }
  PlayBar* bar() { return dynamic_cast<PlayBar*>(window().bar()); }
  bool waitForBar(const std::function<bool(const PlayBarState& state)>& condition) {
    return runUntil([&] { return bar() && condition(bar()->state()); });
  }
  std::string barTexts() { return bar() ? bar()->texts().toStdString() : "no bar"; }
  StartPage* startPage() { return window().findChild<StartPage*>(); }
  bool hasStartPage() { return startPage() && startPage()->isVisible(); }
  bool waitForStartPage() {
    return runUntil([this] { return hasStartPage(); });
  }
  AlertWidget* alert() {
    for (QObject* child : window().children())
      if (auto* const found = dynamic_cast<AlertWidget*>(child)) return found;
    return nullptr;
  }
  std::string waitForAlert() {
    if (!runUntil([this] { return alert() != nullptr; })) return "no alert";
    return alert()->accessibleName().toStdString() + ": " + alert()->accessibleDescription().toStdString();
  }
  bool waitForServers(std::size_t count) {
    return runUntil([count] { return servers().size() == count; });
  }
  // The servers that this process has started.
  static std::set<pid_t> servers() {
    const std::string id = std::to_string(::getpid());
    std::istringstream children(contentsOf("/proc/" + id + "/task/" + id + "/children"));
    return {std::istream_iterator<pid_t>(children), {}};
  }

  TemporaryFolder _session, _device, _files;
  const ApplicationInfo _application{.version = "1.0", .buildDate = "today"};
  Options _options;
  WidgetUserInterface _userInterface{{.startOver = [this] { _player->startOver(); }}};
  std::optional<HostServices> _services;
  ValueHistory _history;
  std::optional<CaptureHistory> _whole;
  std::optional<RowAnswers> _answers;
  std::optional<CaptureCourses> _courses;
  std::optional<VarnelApp> _app;
  std::vector<Player::Saved> _saved;
  std::optional<Player> _player;
};

TEST_F(PlayerTest, WithoutAServerTheEmptyWindowOffersWaysToSeeSomething) {
  launch();
  ASSERT_TRUE(waitForStartPage());
  EXPECT_EQ(pane().toolbar().findChild<QLabel*>()->text(), "Connecting");
  EXPECT_THAT(servers(), IsEmpty());
  EXPECT_EQ(bar(), nullptr);
  EXPECT_TRUE(startPage()->isAncestorOf(QApplication::focusWidget()));
}

TEST_F(PlayerTest, AServerThatIsThereIsShownWithoutAnOffer) {
  const Process server(VARNEL_TELEPHONYD_PROGRAM, {"--simulate", "kalvi-lte"});
  ASSERT_TRUE(
      eventually([this] { return fs::exists(_session.path() / "varnel/com.orvane.TelephonyServer"); }));
  launch();
  ASSERT_TRUE(waitForRow(section));
  EXPECT_FALSE(hasStartPage());
  EXPECT_EQ(bar(), nullptr);
}

TEST_F(PlayerTest, ASimulatedModemIsChosenFromAMenuAndTheOfferGoes) {
  launch();
  ASSERT_TRUE(waitForStartPage());
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
  auto* const menu = window().findChild<QMenu*>();
  ASSERT_NE(menu, nullptr);
  ASSERT_THAT(menu->actions(), SizeIs(6));
  EXPECT_EQ(menu->actions()[1]->text(), "LTE (kalvi-lte)");
  menu->actions()[1]->trigger();
  ASSERT_TRUE(waitForRow(section));
  EXPECT_FALSE(hasStartPage());
  EXPECT_THAT(servers(), SizeIs(1));
  EXPECT_EQ(pane().tableWidget().hasFocus(), true);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Pause; }));
  EXPECT_THAT(barTexts(), HasSubstr("Simulated · 0:0"));
  EXPECT_THAT(waysToClose(), ElementsAre("End the simulated modem", "End the simulated modem"));
  EXPECT_TRUE(offers("End the simulated modem"));
  EXPECT_FALSE(bar()->slider().isVisible());
}

TEST_F(PlayerTest, AFileOfTheCommandLineIsPlayedWithItsTimeAndLength) {
  launch(capture(60));
  ASSERT_TRUE(waitForRow(section));
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.length == 60'000; }));
  ASSERT_TRUE(waitForBar([](const auto& state) { return !state.clock.isEmpty(); }));
  EXPECT_EQ(bar()->state().date, "2023-11-14");
  EXPECT_THAT(bar()->state().clock.toStdString(), testing::StartsWith("22:13:2"));
  EXPECT_THAT(bar()->state().progress.toStdString(), testing::EndsWith(" / 1:00"));
  EXPECT_FALSE(hasStartPage());
}

TEST_F(PlayerTest, AJumpGoesThereWithTheOpenPanes) {
  launch(capture(60));
  openRow(section);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.length == 60'000; }));
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Play; }));
  Q_EMIT bar()->jumpWanted(50'500);
  EXPECT_TRUE(runUntil([this] { return secondShown() == 50; })) << secondShown();
  EXPECT_TRUE(waitForBar([](const auto& state) {
    return state.place == 50'000 && state.clock == "22:14:10";
  })) << barTexts();
  Q_EMIT bar()->jumpWanted(10'500);
  EXPECT_TRUE(runUntil([this] { return secondShown() == 10; })) << secondShown();
  EXPECT_TRUE(waitForBar([](const auto& state) { return state.place == 10'000; })) << barTexts();
  EXPECT_EQ(title(), section);
  Q_EMIT bar()->jumpWanted(0);
  EXPECT_TRUE(runUntil([this] { return secondShown() == 0; })) << secondShown();
  EXPECT_THAT(servers(), SizeIs(1));
}

TEST_F(PlayerTest, TheClockOfTheModelsIsThatOfTheCapture) {
  const PlayedClock& clock = _services->playedClock();
  const auto second = [&clock] { return clock.now().seconds - 1'700'000'000; };
  launch(capture(200));
  openRow(section);
  EXPECT_GE(second(), 0);
  EXPECT_LE(second(), 200);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.length == 200'000; }));
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Play; }));
  Q_EMIT bar()->jumpWanted(150'500);
  ASSERT_TRUE(runUntil([this] { return secondShown() == 150; }));
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.place == 150'000; }));
  EXPECT_EQ(second(), 150);
  const Time paused = clock.now();
  QTest::qWait(1);
  EXPECT_EQ(clock.now(), paused);
  Q_EMIT bar()->jumpWanted(20'500);
  ASSERT_TRUE(runUntil([this] { return secondShown() == 20; }));
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.place == 20'000; }));
  EXPECT_EQ(second(), 20);
  EXPECT_NE(pane().toolbar().findChild<QLabel*>()->text().left(12), "Updated 2023");
  _player->close();
  EXPECT_FALSE(clock.followsCapture());
}

TEST_F(PlayerTest, AJumpOverALeapOfTheClockStampsValuesWithTheTimeOfItsPlace) {
  launch(capture(60, "leap.pcap", 1000));
  openRow(section);
  ASSERT_TRUE(waitForBar([](const auto& state) { return !state.clock.isEmpty() && state.length > 0; }));
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Play; }));
  // The leap of 1000 s takes five.
  Q_EMIT bar()->jumpWanted(54'500);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.place == 54'000; })) << barTexts();
  ASSERT_TRUE(runUntil([this] { return secondShown() == 50; })) << secondShown();
  const auto* const row = _app->nodeAt({section, "Num Tx Antennas"});
  ASSERT_NE(row, nullptr);
  const auto written = static_cast<const VarnelModelLeafNode*>(row)->writtenAt();
  ASSERT_TRUE(written);
  EXPECT_NEAR(static_cast<double>(written->seconds), 1'700'001'050, 2);
}

TEST_F(PlayerTest, AfterAJumpValuesAreAboutAsOldAsInTheCapture) {
  launch(capture(200, "walk.pcap", 0, 20));
  openRow(section);
  pausePlaying();
  jumpTo(150);
  EXPECT_EQ(secondShown(), 20);
  EXPECT_EQ(secondWritten(), 30) << "the end of a stage";
  EXPECT_EQ(factsShown().dimming, CellDimming::Value);
  jumpTo(70);
  EXPECT_EQ(secondShown(), 20);
  EXPECT_EQ(secondWritten(), 25);
  EXPECT_EQ(factsShown().dimming, CellDimming::None);
  jumpTo(90);
  EXPECT_EQ(secondWritten(), 25) << "nothing new has come";
  EXPECT_EQ(factsShown().dimming, CellDimming::Value);
  jumpTo(10);
  EXPECT_EQ(secondShown(), 10);
  EXPECT_EQ(secondWritten(), 10);
  EXPECT_EQ(factsShown().dimming, CellDimming::None);
}

TEST_F(PlayerTest, NothingBecomesOldWhileTheFileIsPaused) {
  launch(capture(200, "walk.pcap", 0, 20));
  openRow(section);
  pausePlaying();
  Q_EMIT bar()->speedWanted(1000);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.speed == 1000; }));
  jumpTo(40);
  const Time before = _services->playedClock().now();
  EXPECT_EQ(factsShown().dimming, CellDimming::None);
  // Played at this speed, the value would be old.
  QTest::qWait(100);
  _app->refresh();
  EXPECT_EQ(_services->playedClock().now(), before);
  EXPECT_EQ(factsShown().dimming, CellDimming::None);
  EXPECT_EQ(secondShown(), 20);
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  EXPECT_TRUE(runUntil([this] {
    _app->refresh();
    return factsShown().dimming == CellDimming::Value;
  }));
}

TEST_F(PlayerTest, AJumpWhileTheFileIsPlayedGoesOnThere) {
  launch(capture(200));
  openRow(section);
  ASSERT_TRUE(waitForBar([](const auto& state) { return !state.clock.isEmpty() && state.length > 0; }));
  for (const int place : {150'500, 100'500}) {
    Q_EMIT bar()->jumpWanted(place);
    EXPECT_EQ(bar()->state().button, PlayBarState::Button::Pause);
    EXPECT_TRUE(waitForBar([&](const auto& state) {
      return state.place > place && state.place < place + 40'000;
    })) << barTexts();
    EXPECT_EQ(bar()->state().button, PlayBarState::Button::Pause);
    EXPECT_TRUE(runUntil([&] { return secondShown() > place / 1000; }));
    EXPECT_LT(secondShown(), place / 1000 + 40);
  }
}

TEST_F(PlayerTest, APauseDuringAJumpIsThatOfItsPlace) {
  launch(capture(200));
  openRow(section);
  ASSERT_TRUE(waitForBar([](const auto& state) { return !state.clock.isEmpty() && state.length > 0; }));
  Q_EMIT bar()->jumpWanted(150'500);
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  EXPECT_EQ(bar()->state().button, PlayBarState::Button::Play);
  EXPECT_TRUE(waitForBar([](const auto& state) { return state.place == 150'000; })) << barTexts();
  EXPECT_TRUE(runUntil([this] { return secondShown() == 150; }));
  EXPECT_EQ(bar()->state().button, PlayBarState::Button::Play);
}

TEST_F(PlayerTest, AfterAJumpARowHasItsCourseUpToThere) {
  const std::string path = capture(200);
  _whole.emplace(CaptureHistory::Wish{.path = path, .program = VARNEL_NUMBERS_PROGRAM});
  ASSERT_TRUE(runUntil([this] { return !_whole->isReading(); }));
  ASSERT_EQ(_whole->remark(), "");
  launch(path);
  openRow(section);
  pausePlaying();
  for (const int second : {150, 60}) {
    jumpTo(second);
    const auto course = factsShown().course;
    ASSERT_THAT(course, SizeIs(24));
    ASSERT_TRUE(course[23]);
    EXPECT_NEAR(*course[23], second, 2);
    ASSERT_TRUE(course[18]);
    EXPECT_NEAR(*course[18], second - 50, 10);
    EXPECT_EQ(course[23 - second / 10 - 2], std::nullopt) << "before the file";
  }
}

TEST_F(PlayerTest, TheEndIsShownAndTheCaptureIsPlayedAgain) {
  launch(capture(60));
  openRow(section);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.length == 60'000; }));
  Q_EMIT bar()->speedWanted(600);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Again; }))
      << barTexts();
  EXPECT_THAT(barTexts(), HasSubstr("End · 1:00"));
  EXPECT_EQ(bar()->speedButton().text(), "600×");
  EXPECT_TRUE(runUntil([this] { return secondShown() == 60; }));
  Q_EMIT bar()->speedWanted(1);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.speed == 1; }));
  QTest::mouseClick(&bar()->playButton(), Qt::LeftButton);
  EXPECT_TRUE(waitForBar(
      [](const auto& state) { return state.button == PlayBarState::Button::Pause && state.place < 50'000; }));
  EXPECT_TRUE(runUntil([this] { return secondShown() < 60; }));
  EXPECT_EQ(title(), section);
}

TEST_F(PlayerTest, StartingOverAfterTheEndPlaysTheCaptureFromItsStart) {
  launch(capture(20));
  ASSERT_TRUE(waitForRow(section));
  Q_EMIT bar()->speedWanted(600);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Again; }));
  Q_EMIT bar()->speedWanted(1);
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.speed == 1; }));
  _player->startOver();
  EXPECT_TRUE(waitForBar([](const auto& state) { return state.button == PlayBarState::Button::Pause; }));
  ASSERT_TRUE(waitForRow(section));
}

TEST_F(PlayerTest, AModemsPortIsShown) {
  const Process modem(VARNEL_TELEPHONYD_PROGRAM, {"--simulate", "all-radios", "--pty"});
  ASSERT_TRUE(eventually([&] { return modem.output().ends_with('\n'); }));
  std::string port = modem.output();
  port.pop_back();
  launch();
  _player->connectToPort(port);
  EXPECT_EQ(barTexts(), "Opening " + port + "…");
  ASSERT_TRUE(waitForRow("SIM 1"));
  EXPECT_EQ(barTexts(), "Port " + port);
  EXPECT_FALSE(bar()->playButton().isVisible());
  EXPECT_THAT(waysToClose(), ElementsAre("Leave the port", "Leave the port"));
  EXPECT_FALSE(offers("Play or pause"));
}

TEST_F(PlayerTest, AFileThatCannotBeOpenedIsToldAndTheWindowOffersWhatItOffered) {
  launch("/no such file");
  EXPECT_EQ(waitForAlert(),
            "The file cannot be opened: cannot open /no such file: No such file or directory");
  QTest::mouseClick(&alert()->button(), Qt::LeftButton);
  EXPECT_TRUE(waitForStartPage());
  EXPECT_EQ(bar(), nullptr);
}

TEST_F(PlayerTest, AFileThatCannotBeOpenedLeavesTheOneThatPlays) {
  launch(capture(200));
  openRow(section);
  const auto before = servers();
  const std::string text = _files.file("text");
  std::ofstream(text) << "a text of some length, which is no capture of a modem at all\n";
  _player->open(text);
  EXPECT_THAT(waitForAlert(), HasSubstr(text + " holds text, no capture"));
  EXPECT_EQ(servers(), before);
  EXPECT_EQ(title(), section);
  EXPECT_TRUE(runUntil([this, former = secondShown()] { return secondShown() > former; }));
}

TEST_F(PlayerTest, AnotherFileEndsTheServerOfTheFirst) {
  launch(capture(60));
  ASSERT_TRUE(waitForRow(section));
  const auto first = servers();
  ASSERT_THAT(first, SizeIs(1));
  _player->open(capture(30, "other.pcap"));
  ASSERT_TRUE(waitForBar([](const auto& state) { return state.length == 30'000; }));
  ASSERT_TRUE(waitForRow(section));
  EXPECT_TRUE(waitForServers(1));
  EXPECT_NE(servers(), first);
}

TEST_F(PlayerTest, AServerThatIsKilledIsToldAndStartedAgain) {
  launch(capture(200));
  openRow(section);
  ASSERT_THAT(servers(), SizeIs(1));
  const pid_t first = *servers().begin();
  ::kill(first, SIGKILL);
  ASSERT_TRUE(waitForBar([](const auto& state) { return !state.message.isEmpty(); }));
  EXPECT_EQ(barTexts(), "The server was ended by a signal");
  QTest::mouseClick(&bar()->remedyButton(), Qt::LeftButton);
  ASSERT_TRUE(
      waitForBar([](const auto& state) { return state.message.isEmpty() && state.length == 200'000; }));
  EXPECT_TRUE(
      runUntil([this, former = secondShown()] { return secondShown() >= 0 && secondShown() != former; }));
  EXPECT_EQ(title(), section);
  EXPECT_TRUE(waitForServers(1));
  EXPECT_THAT(servers(), testing::Not(Contains(first)));
}

TEST_F(PlayerTest, ClosingTheFileEndsItsServerAndReturnsToTheOffer) {
  launch(capture(60));
  ASSERT_TRUE(waitForRow(section));
  EXPECT_THAT(waysToClose(), ElementsAre("Close the file", "Close the file"));
  EXPECT_TRUE(offers("Close the file"));
  EXPECT_TRUE(offers("Play or pause"));
  QTest::mouseClick(&bar()->closeButton(), Qt::LeftButton);
  EXPECT_FALSE(offers("Close the file")) << "there is none";
  EXPECT_FALSE(offers("Play or pause"));
  EXPECT_TRUE(waitForServers(0));
  EXPECT_TRUE(waitForStartPage());
  EXPECT_EQ(bar(), nullptr);
  EXPECT_THAT(rows(), IsEmpty());
}

// The server would end after three seconds by force.
TEST_F(PlayerTest, ClosingTheFileDoesNotWaitForItsServer) {
  launch(capture(60));
  ASSERT_TRUE(waitForRow(section));
  ASSERT_THAT(servers(), SizeIs(1));
  ::kill(*servers().begin(), SIGSTOP);
  QTest::mouseClick(&bar()->closeButton(), Qt::LeftButton);
  EXPECT_THAT(servers(), SizeIs(1));
  EXPECT_EQ(bar(), nullptr);
  EXPECT_TRUE(waitForServers(0));
}

TEST_F(PlayerTest, ASnapshotIsWalkedThroughWithoutAServer) {
  launch(snapshot({"-90 dBm", "-91 dBm", "-92 dBm"}));
  openRow("Cell");
  EXPECT_THAT(rows(), ElementsAre("RSRP: -92 dBm"));
  EXPECT_THAT(waysToClose(), ElementsAre("Close the snapshot", "Close the snapshot"));
  EXPECT_EQ(barTexts(), "2023-11-14 22:13:22 | Display 3 of 3");
  EXPECT_EQ(pane().toolbar().findChild<QLabel*>()->text(), "Display of 2023-11-14 at 22:13:22");
  EXPECT_FALSE(bar()->playButton().isVisible());
  bar()->slider().setFocus();
  QTest::keyClick(&bar()->slider(), Qt::Key_Left);
  EXPECT_THAT(rows(), ElementsAre("RSRP: -91 dBm"));
  EXPECT_EQ(title(), "Cell");
  QTest::keyClick(&bar()->slider(), Qt::Key_Left);
  EXPECT_THAT(rows(), ElementsAre("RSRP: -90 dBm"));
  EXPECT_EQ(barTexts(), "2023-11-14 22:13:20 | Display 1 of 3");
  EXPECT_THAT(servers(), IsEmpty());
  QTest::keyClick(&window(), Qt::Key_R, Qt::ControlModifier);
  EXPECT_TRUE(runUntil([this] { return hasRow("RSRP: -90 dBm"); }));
}

TEST_F(PlayerTest, ASnapshotIsToldWithAllOfItsDisplaysAndTheTimeOfTheOneThatIsShown) {
  launch(snapshot({"-90 dBm", "-91 dBm"}));
  ASSERT_EQ(_saved.size(), 1U);
  EXPECT_THAT(_saved[0].path, testing::EndsWith("saved.varnel"));
  EXPECT_THAT(_saved[0].displays, SizeIs(2));
  EXPECT_EQ(_player->savedTime(), (Time{1'700'000'001, 0}));
  QTest::keyClick(&bar()->slider(), Qt::Key_Left);
  EXPECT_EQ(_player->savedTime(), (Time{1'700'000'000, 0}));
  _player->close();
  EXPECT_EQ(_player->savedTime(), std::nullopt);
}

TEST_F(PlayerTest, ASnapshotWithoutADisplayIsTold) {
  launch(snapshot({}));
  EXPECT_THAT(waitForAlert(), HasSubstr("saved.varnel is a snapshot without a display"));
  EXPECT_EQ(bar(), nullptr);
}

TEST_F(PlayerTest, AFileIsDroppedOntoTheWindow) {
  launch();
  QMimeData data;
  data.setUrls({QUrl::fromLocalFile(QString::fromStdString(snapshot({"-90 dBm"})))});
  QDragEnterEvent enter({10, 10}, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
  QApplication::sendEvent(&window(), &enter);
  EXPECT_TRUE(enter.isAccepted());
  QDropEvent drop({10, 10}, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
  QApplication::sendEvent(&window(), &drop);
  EXPECT_THAT(rows(), ElementsAre("Cell"));
  data.setUrls({QUrl(QStringLiteral("https://example.org/walk.pcap"))});
  QDragEnterEvent other({10, 10}, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
  QApplication::sendEvent(&window(), &other);
  EXPECT_FALSE(other.isAccepted());
}

TEST_F(PlayerTest, AFileThatAnotherProgramWouldMoveIsCopied) {
  launch();
  QMimeData data;
  data.setUrls({QUrl::fromLocalFile(QString::fromStdString(snapshot({"-90 dBm"})))});
  const Qt::DropActions both = Qt::CopyAction | Qt::MoveAction;
  QDragEnterEvent enter({10, 10}, both, &data, Qt::LeftButton, Qt::ShiftModifier);
  ASSERT_EQ(enter.proposedAction(), Qt::MoveAction);
  QApplication::sendEvent(&window(), &enter);
  EXPECT_TRUE(enter.isAccepted());
  EXPECT_EQ(enter.dropAction(), Qt::CopyAction);
  QDropEvent drop({10, 10}, both, &data, Qt::LeftButton, Qt::ShiftModifier);
  QApplication::sendEvent(&window(), &drop);
  EXPECT_TRUE(drop.isAccepted());
  EXPECT_EQ(drop.dropAction(), Qt::CopyAction);
}

TEST_F(PlayerTest, TheOpenFileIsThatOfASnapshotToo) {
  launch();
  EXPECT_EQ(_player->openFile(), "");
  _player->open(snapshot({"-90 dBm"}));
  EXPECT_EQ(_player->openFile(), _files.file("saved.varnel"));
  _player->open(capture(60));
  ASSERT_TRUE(waitForRow(section));
  EXPECT_EQ(_player->openFile(), _files.file("walk.pcap"));
  _player->close();
  EXPECT_EQ(_player->openFile(), "");
}

TEST_F(PlayerTest, AFileThatGivesNothingCanBeCanceled) {
  const std::string pipe = _files.file("pipe");
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  launch(pipe);
  ASSERT_TRUE(runUntil([this] { return bar() != nullptr; }));
  EXPECT_EQ(bar()->state().message.toStdString(), "Opening " + pipe + "…");
  EXPECT_EQ(bar()->state().remedy, "Cancel");
  Q_EMIT bar()->remedyWanted();
  EXPECT_TRUE(waitForStartPage());
  EXPECT_EQ(bar(), nullptr);
}

TEST_F(PlayerTest, APortThatCannotBeOpenedIsTold) {
  launch();
  _player->connectToPort(_files.file("no port"));
  ASSERT_NE(bar(), nullptr);
  EXPECT_EQ(barTexts(), "Opening " + _files.file("no port") + "…");
  EXPECT_THAT(waitForAlert(), HasSubstr("There is no link to the modem: "));
  EXPECT_EQ(bar(), nullptr);
}

TEST_F(PlayerTest, TheEndOfTheApplicationEndsTheServer) {
  launch(capture(60));
  ASSERT_TRUE(waitForRow(section));
  _app->applicationWillTerminate();
  _player.reset();
  EXPECT_THAT(servers(), IsEmpty());
  for (const auto& entry : fs::directory_iterator(_session.path()))
    EXPECT_EQ(entry.path().filename(), "varnel");
}

}  // namespace
}  // namespace varnel
