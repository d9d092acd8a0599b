#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/VarnelApp.h"
#include "base/PropertyList.h"
#include "terminal/Characters.h"
#include "terminal/TerminalUserInterface.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/FakeDeviceFiles.h"
#include "tests/support/FakeLinkReports.h"
#include "tests/support/FakeQueue.h"
#include "tests/support/FakeTelephony.h"
#include "tests/support/MemoryPorts.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/RecordingPreferences.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::Not;

constexpr std::string_view channel = "com.orvane.BasebandStateReport.LogChannel";
constexpr const char* marker = "/OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

// The application's screens in a terminal of 40 columns and 8 rows.
class TerminalScreens : public testing::Test {
 protected:
  TerminalScreens() {
    host.resources.add("LTE", dictionaryOf({{"PDP Context Info", Value::ofArray()},
                                            {"Serving Cell Info", Value::ofDictionary()}}));
    host.resources.add(
        "VarnelSaveViewController",
        dictionaryOf(
            {{"Margin", Value::ofInteger(10)},
             {"Spacing", Value::ofInteger(10)},
             {"Rows",
              Value::ofArray(
                  {Value::ofArray(
                       {dictionaryOf({{"Kind", "Button"}, {"Title", "Cancel"}, {"Action", "cancelPressed:"}}),
                        dictionaryOf({{"Kind", "Space"}}),
                        dictionaryOf({{"Kind", "Button"}, {"Title", "Save"}, {"Action", "savePressed:"}})}),
                   Value::ofArray({dictionaryOf({{"Kind", "TextField"}, {"Outlet", "saveDescription"}})}),
                   Value::ofArray({dictionaryOf({{"Kind", "Table"}, {"Outlet", "saveContentTable"}})})})}}));
    // In a zone two hours east of UTC it is 14:05:09.
    host.clock.set({1709294709, 0});
    host.clock.setZone({7200, false});
    ports.answer = [](const MemoryPorts::Request&) {
      return RemotePort::SendResult{0, writeXmlPropertyList(dictionaryOf({{"GetTechnology", "kalvi-lte"}}))};
    };
  }

  // Shows two packet-data contexts with this access point.
  void launch(const std::string& accessPoint = "internet") {
    userInterface.resize(40, 8);
    app.applicationDidFinishLaunching();
    queue.run();
    receive(accessPoint);
  }
  void receive(const std::string& accessPoint) {
    const Value list = Value::ofArray({dictionaryOf({{"APN", accessPoint}, {"State", "on"}}),
                                       dictionaryOf({{"APN", "ims"}, {"State", "off"}})});
    ports.deliver(channel, 0, serverMessage(0xFF0002, list));
    queue.advance(2s);
  }
  void type(const std::wstring& letters) {
    for (const wchar_t letter : letters) press(Key::of(letter));
  }
  void press(const Key& key) {
    userInterface.take(key);
    queue.run();
  }
  void press(Key::Kind kind) { press(Key{kind}); }
  std::string shown() const { return picture.text(); }
  std::string line(int row) const { return picture.line(row); }

  RecordingLog log;
  TestServices host;
  FakeQueue queue;
  MemoryPorts ports;
  FakeTelephony telephony;
  FakeDeviceFiles files;
  FakeLinkReports link;
  RecordingPreferences preferences;
  CellGrid picture{1, 1};
  unsigned pictures = 0;
  std::vector<std::string> wishes;
  TerminalUserInterface userInterface{
      queue,
      {.close = [this] { wishes.emplace_back("close"); },
       .startOver = [this] { app.startOver(); },
       .save = [this] { app.save(); },
       .find =
           [this](const std::string& words) {
             std::vector<FoundRow> rows;
             for (const FoundNode& node : app.find(words)) rows.push_back({node.path, node.value});
             return rows;
           },
       .goTo = [this](const FoundRow& row) { app.goTo(row.path); },
       .explain = [](const std::vector<std::string>& path) { return "About " + path.back() + "\n"; },
       .course = [this](const std::vector<std::string>& path) { return courseOf(path); },
       .heldLines = [this] { return held; },
       .suspend = [this] { wishes.emplace_back("suspend"); },
       .redraw = [this] { wishes.emplace_back("redraw"); }},
      [this](const CellGrid& grid) {
        picture = grid;
        ++pictures;
      }};
  // "State" has a course of as many columns as are asked for, which rises from 1 to 2.
  CoursePage::Source courseOf(const std::vector<std::string>& path) const {
    if (path.back() != "State") return {};
    return [this](std::chrono::minutes length, int columns) -> std::optional<CourseColumns> {
      if (hasLostCourse) return std::nullopt;
      CourseColumns course{"State", "dB", "over " + std::to_string(length.count()), "12:00", "12:05", {}};
      course.columns.resize(static_cast<std::size_t>(columns), CourseColumns::Range{1, 1});
      course.columns.front().reset();
      course.columns.back() = CourseColumns::Range{1, 2};
      return course;
    };
  }

  bool hasLostCourse = false;
  std::string held = "first line\nlast line\n";
  VarnelApp app{{{ports, telephony, queue, host.services, writeXmlPropertyList, &link},
                 files,
                 preferences,
                 userInterface,
                 "press R"}};
};

TEST_F(TerminalScreens, BeforeTheLinkThereIsATurningWheel) {
  userInterface.resize(40, 8);
  telephony.refusesConnections = true;
  app.applicationDidFinishLaunching();
  queue.run();
  EXPECT_THAT(line(7), HasSubstr("◐ Connecting"));
  queue.advance(500ms);
  EXPECT_THAT(line(7), HasSubstr("◓ Connecting"));
}

TEST_F(TerminalScreens, TheRootPaneListsTheSections) {
  launch();
  EXPECT_EQ(shown(),
            " kalvi-lte — Varnel\n"
            " PDP Context Info                      ›\n"
            " Serving Cell Info                     ›\n"
            "\n\n\n\n"
            " Updated 2024-03-01 at 14:05:09  ? Help\n");
}

TEST_F(TerminalScreens, ReturnOpensARowAndEscapeGoesBack) {
  launch();
  press(Key::Kind::Enter);
  EXPECT_EQ(line(0), " PDP Context Info    kalvi-lte — Varnel");
  press(Key::Kind::Enter);
  EXPECT_EQ(line(0), " PDP Context Info › 0");
  EXPECT_EQ(line(1), " APN                          internet");
  EXPECT_EQ(line(2), " State                              on");
  press(Key::Kind::Escape);
  type(L"h");
  EXPECT_EQ(line(1), " PDP Context Info                      ›");
  press(Key::Kind::Left);
  EXPECT_EQ(line(1), " PDP Context Info                      ›") << "the root stays";
}

TEST_F(TerminalScreens, ChangedRowsAreMarkedUntilTheNextRefresh) {
  launch();
  type(L"ll");
  receive("other");
  EXPECT_EQ(line(1), "•APN                             other");
  EXPECT_EQ(line(2), " State                              on");
  type(L"hh");
  EXPECT_EQ(line(1), "•PDP Context Info                      ›");
  receive("other");
  EXPECT_EQ(line(1), " PDP Context Info                      ›");
}

TEST_F(TerminalScreens, ARefreshKeepsThePlace) {
  launch();
  type(L"ll");
  press(Key::Kind::Down);
  receive("other");
  EXPECT_TRUE(picture.at(0, 2).look.isReversed);
  EXPECT_FALSE(picture.at(0, 1).look.isReversed);
}

TEST_F(TerminalScreens, LongValuesScrollSideways) {
  launch("abcdefghijklmnopqrstuvwxyz0123456789ABCDEFGHIJKLMNOP");
  type(L"ll");
  EXPECT_EQ(line(1), " APN     abcdefghijklmnopqrstuvwxyz01…");
  type(L">");
  EXPECT_EQ(line(1), "…abcdefghijklmnopqrstuvwxyz0123456789…");
  press(Key::Kind::ShiftRight);
  press(Key::Kind::ShiftRight);
  EXPECT_EQ(line(1), "…pqrstuvwxyz0123456789ABCDEFGHIJKLMNOP");
  receive("abcdefghijklmnopqrstuvwxyz0123456789ABCDEFGHIJKLMNOQ");
  EXPECT_EQ(line(1), "•pqrstuvwxyz0123456789ABCDEFGHIJKLMNOQ") << "a refresh keeps the place";
  type(L"<<<");
  EXPECT_EQ(line(1), "•APN     abcdefghijklmnopqrstuvwxyz01…");
}

TEST_F(TerminalScreens, TheNoticeIsTheSecondLine) {
  launch();
  link.report.serverNote = "The replay has ended";
  queue.advance(2s);
  EXPECT_EQ(line(1), "The replay has ended");
  EXPECT_EQ(line(2), " PDP Context Info                      ›");
}

TEST_F(TerminalScreens, ALongNoticeLeavesHalfOfTheScreenToTheRows) {
  launch();
  link.report.serverNote =
      "one two three four five six seven eight nine ten eleven twelve thirteen fourteen "
      "fifteen sixteen seventeen eighteen nineteen twenty and many more of them";
  queue.advance(2s);
  EXPECT_EQ(line(3), "fifteen sixteen seventeen eighteen");
  EXPECT_EQ(line(4), " PDP Context Info                      ›");
}

TEST_F(TerminalScreens, TheNoticeStaysAboveEveryPage) {
  launch();
  link.report.serverNote = "The replay has ended";
  queue.advance(2s);
  type(L"/apn");
  EXPECT_EQ(line(0), "Find: [apn                             ]");
  EXPECT_EQ(line(1), "The replay has ended");
  EXPECT_EQ(line(2), " PDP Context Info › 0 › APN    internet");
  EXPECT_TRUE(picture.hasCursor());
  press({Key::Kind::Click, 0, 3, 1});
  EXPECT_EQ(line(1), "The replay has ended") << "a click on the notice does nothing";
  EXPECT_EQ(line(0), "Find: [apn                             ]");
  press({Key::Kind::Click, 0, 3, 3});
  EXPECT_EQ(line(0), " PDP Context Info › 1") << "the row under the pointer";
  press(Key::Kind::Down);
  type(L"T");
  EXPECT_EQ(line(0), " State in dB");
  EXPECT_EQ(line(1), "The replay has ended");
  EXPECT_EQ(line(2), " over 5");
  type(L"q?");
  EXPECT_EQ(line(0), " Help");
  EXPECT_EQ(line(1), "The replay has ended");
  EXPECT_EQ(line(2), "About State");
  link.report.serverNote.clear();
  queue.advance(2s);
  EXPECT_EQ(line(1), "About State") << "the notice is over";
}

TEST_F(TerminalScreens, FromAWidthOf120OnTwoPanesStandSideBySide) {
  launch();
  userInterface.resize(120, 8);
  queue.run();
  EXPECT_THAT(line(1), Not(HasSubstr("│"))) << "there is only one pane";
  type(L"ll");
  EXPECT_THAT(line(0), testing::StartsWith(" PDP Context Info › 0"));
  EXPECT_EQ(line(1), " 0" + std::string(56, ' ') + "›│ APN" + std::string(46, ' ') + "internet");
  EXPECT_EQ(line(2), " 1" + std::string(56, ' ') + "›│ State" + std::string(50, ' ') + "on");
  userInterface.resize(119, 8);
  queue.run();
  EXPECT_THAT(line(1), Not(HasSubstr("│")));
}

TEST_F(TerminalScreens, AClickOnTheLeftPaneOpensThatRowInsteadOfTheOpenOne) {
  launch();
  userInterface.resize(120, 8);
  type(L"ll");
  press({Key::Kind::Click, 0, 3, 2});
  EXPECT_THAT(line(0), testing::StartsWith(" PDP Context Info › 1"));
  EXPECT_THAT(line(1), HasSubstr("ims"));
}

TEST_F(TerminalScreens, AClickOnTheTitleGoesBack) {
  launch();
  type(L"l");
  press({Key::Kind::Click, 0, 3, 0});
  EXPECT_EQ(line(1), " PDP Context Info                      ›");
}

TEST_F(TerminalScreens, ATinyScreenShowsWhatFitsAndNothingPassesItsEdge) {
  launch();
  type(L"ll");
  for (int columns = 1; columns <= 22; ++columns) {
    for (int rows = 1; rows <= 6; ++rows) {
      userInterface.resize(columns, rows);
      queue.run();
      type(L"?jkGgq/x");
      press(Key::Kind::Escape);
      type(L"LGqT");
      press(Key::Kind::Enter);
      type(L"jT+-");
      ASSERT_EQ(picture.columns(), columns);
      type(L"qk");
      for (int row = 0; row < rows; ++row) ASSERT_LE(columnsOf(line(row)), columns);
    }
  }
  userInterface.resize(20, 5);
  queue.run();
  EXPECT_EQ(shown(),
            " … Context Info › 0\n"
            " APN      internet\n"
            " State          on\n"
            "\n"
            " Updated 2024-03-01…\n");
}

TEST_F(TerminalScreens, FindShowsRowsWithTheirSectionsAndReturnGoesThere) {
  launch();
  type(L"/state");
  EXPECT_EQ(line(0), "Find: [state                           ]");
  EXPECT_EQ(line(1), " PDP Context Info › 0 › State        on");
  EXPECT_EQ(line(2), " PDP Context Info › 1 › State       off");
  EXPECT_THAT(line(7), testing::StartsWith(" 2 rows"));
  press(Key::Kind::Down);
  press(Key::Kind::Enter);
  EXPECT_EQ(line(0), " PDP Context Info › 1");
  EXPECT_TRUE(picture.at(0, 2).look.isReversed) << "the row has the focus";
  type(L"h");
  EXPECT_TRUE(picture.at(0, 2).look.isReversed) << "so has the section above, on the way back";
}

TEST_F(TerminalScreens, FindFollowsTheDisplayAndEscapeLeavesIt) {
  launch();
  type(L"/apn");
  receive("other");
  EXPECT_EQ(line(1), " PDP Context Info › 0 › APN       other");
  press(Key::Kind::Backspace);
  type(L"x");
  EXPECT_EQ(line(1), "");
  press(Key::Kind::Enter);
  EXPECT_THAT(line(0), testing::StartsWith("Find:")) << "there is nothing to go to";
  press(Key::Kind::Escape);
  EXPECT_EQ(line(1), "•PDP Context Info                      ›");
}

TEST(FindPage, TheFocusStaysOnItsRowWhenRowsComeAndGo) {
  std::vector<FoundRow> rows;
  for (const char* name : {"a", "b", "c", "d", "e"}) rows.push_back({{"Section", name}});
  std::string chosen;
  FindPage page([&](const std::string&) { return rows; },
                [&](const FoundRow& row) { chosen = row.path.back(); });
  CellGrid grid(20, 4);  // two rows fit
  page.paint(grid, unicodeGlyphs);
  for (int i = 0; i < 3; ++i) page.take(Key{Key::Kind::Down});
  page.paint(grid, unicodeGlyphs);
  EXPECT_EQ(grid.line(2), " Section › d");
  rows.erase(rows.begin(), rows.begin() + 2);
  page.paint(grid, unicodeGlyphs);
  EXPECT_EQ(grid.line(1), " Section › c");
  EXPECT_EQ(grid.line(2), " Section › d");
  EXPECT_TRUE(grid.at(0, 2).look.isReversed);
  page.take(Key{Key::Kind::Enter});
  EXPECT_EQ(chosen, "d");
}

TEST_F(TerminalScreens, F1HelpsInEveryPageAndLeadsBack) {
  files.existing.insert(marker);
  launch();
  for (const wchar_t page : {L'/', L'T', L's'}) {
    type({page});
    const std::string former = shown();
    press(Key::Kind::Help);
    EXPECT_EQ(line(0), " Help");
    EXPECT_THAT(line(1), testing::StartsWith("Up Down j k")) << "the row is not in sight";
    press(Key::Kind::Help);
    EXPECT_EQ(shown(), former);
    press(Key::Kind::Escape);
  }
}

TEST_F(TerminalScreens, HelpBeginsWithTheRowThatHasTheFocus) {
  launch();
  for (const Key& key : {Key::of(L'?'), Key{Key::Kind::Help}}) {
    press(key);
    EXPECT_EQ(line(0), " Help");
    EXPECT_EQ(line(1), "About PDP Context Info");
    type(L"q");
    EXPECT_EQ(line(1), " PDP Context Info                      ›");
  }
}

TEST_F(TerminalScreens, LShowsTheLastHeldLines) {
  launch();
  type(L"L");
  EXPECT_EQ(line(1), "first line");
  EXPECT_EQ(line(2), "last line");
  held += "a\nb\nc\nd\ne\n";
  receive("internet");
  EXPECT_EQ(line(6), "e") << "it stays at the end";
  type(L"g");
  EXPECT_EQ(line(1), "first line");
  type(L"L");
  EXPECT_EQ(line(1), " PDP Context Info                      ›");
}

TEST_F(TerminalScreens, TShowsTheCourseOfTheRowsValue) {
  launch();
  type(L"ll");
  press(Key::Kind::Down);
  type(L"T");
  const std::string bars = "▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁▁";
  EXPECT_EQ(shown(),
            " State in dB\n"
            " over 5\n"
            "        2                              █\n" +
                std::string(39, ' ') + "█\n" + std::string(39, ' ') + "█\n" + "        1  " + bars +
                "█\n"
                "          12:00                    12:05\n"
                " 5 minutes             + - Time  q Back\n");
  type(L"+");
  EXPECT_EQ(line(1), " over 20");
  type(L"---");
  EXPECT_EQ(line(1), " over 1");
  EXPECT_THAT(line(7), testing::StartsWith(" 1 minute "));
  hasLostCourse = true;
  type(L"+");
  EXPECT_EQ(line(0), " This value has gone");
  type(L"T");
  EXPECT_EQ(line(0), " PDP Context Info › 0");
}

TEST(CoursePage, TheNumbersAtTheAxisAreWholeAndExact) {
  const auto paint = [](double lowest, double highest, unsigned decimals) {
    CoursePage page([=](std::chrono::minutes, int columns) {
      CourseColumns course{"Cell Identity", "", "", "12:00", "12:05", {}, decimals};
      course.columns.resize(static_cast<std::size_t>(columns), CourseColumns::Range{lowest, highest});
      return std::optional(course);
    });
    CellGrid grid(40, 8);
    page.paint(grid, unicodeGlyphs);
    return grid;
  };
  const CellGrid identity = paint(25800720, 25800721, 0);
  EXPECT_THAT(identity.line(2), testing::StartsWith(" 25800721 █"));
  EXPECT_THAT(identity.line(5), testing::StartsWith(" 25800720 █"));
  const CellGrid wide = paint(-12345678.5, 1234567.25, 2);
  EXPECT_THAT(wide.line(2), testing::StartsWith("  1234567.25 █"));
  EXPECT_THAT(wide.line(5), testing::StartsWith("-12345678.50 █"));
  EXPECT_THAT(wide.line(6), testing::StartsWith("             12:00"));
}

TEST_F(TerminalScreens, ARowWithoutANumberHasNoCourse) {
  launch();
  type(L"T");
  EXPECT_THAT(shown(), HasSubstr("The value of this row is no number."));
}

TEST_F(TerminalScreens, SOpensTheSaveScreenOnDevicesThatAllowIt) {
  files.existing.insert(marker);
  launch();
  EXPECT_EQ(line(7), " Updated 2024-03-01 at 14:05:09  ? Help") << "no room for the button";
  type(L"s");
  EXPECT_EQ(line(1), " [ Cancel ]                    [ Save ]");
  EXPECT_THAT(line(2), testing::StartsWith(" ["));
  type(L"dé");
  EXPECT_THAT(line(2), testing::StartsWith(" [dé "));
  EXPECT_TRUE(picture.hasCursor());
  press(Key::Kind::Enter);
  EXPECT_FALSE(picture.hasCursor()) << "Return goes on to the Save button";
  press(Key::Kind::Enter);
  EXPECT_THAT(line(1), testing::StartsWith("Saved:"));
}

TEST_F(TerminalScreens, EscapeLeavesTheSaveScreenAndCtrlSSaves) {
  files.existing.insert(marker);
  launch();
  press(Key::control(L's'));
  press(Key::Kind::Escape);
  EXPECT_EQ(line(1), " PDP Context Info                      ›");
  press(Key::control(L's'));
  press(Key::control(L's'));
  EXPECT_THAT(line(1), testing::StartsWith("Saved:"));
}

TEST_F(TerminalScreens, OnASmallScreenTheButtonsOfTheSaveScreenAreNarrow) {
  files.existing.insert(marker);
  launch();
  type(L"s");
  userInterface.resize(20, 5);
  queue.run();
  EXPECT_EQ(line(1), " [Cancel]    [Save]");
}

TEST_F(TerminalScreens, TabGoesAroundTheSaveScreen) {
  files.existing.insert(marker);
  launch();
  type(L"s");
  press(Key::Kind::Tab);
  EXPECT_TRUE(picture.at(1, 3).look.isReversed) << "the table";
  press(Key::Kind::Tab);
  EXPECT_TRUE(picture.at(1, 1).look.isReversed) << "Cancel";
  press(Key::Kind::BackTab);
  press(Key::Kind::BackTab);
  EXPECT_TRUE(picture.hasCursor()) << "the text";
}

TEST_F(TerminalScreens, AFailureToSaveIsAnAlertAboveEverything) {
  files.existing.insert(marker);
  files.refusesWrites = true;
  launch();
  type(L"s");
  press(Key::control(L's'));
  EXPECT_THAT(shown(), HasSubstr("File Error"));
  EXPECT_THAT(shown(), HasSubstr("[ Close ]"));
  type(L"q");
  EXPECT_THAT(shown(), HasSubstr("File Error")) << "it takes all keys";
  press(Key::Kind::Enter);
  EXPECT_THAT(shown(), Not(HasSubstr("File Error")));
}

TEST_F(TerminalScreens, OnOtherDevicesSTellsWhyNothingIsSaved) {
  launch();
  type(L"s");
  EXPECT_THAT(shown(), HasSubstr("snapshot"));
}

TEST_F(TerminalScreens, RStartsOver) {
  launch();
  type(L"llR");
  EXPECT_THAT(line(7), HasSubstr("Connecting"));
  EXPECT_EQ(line(1), "");
}

TEST_F(TerminalScreens, QCtrlQAndCtrlCEnd) {
  launch();
  type(L"q");
  press(Key::control(L'q'));
  press(Key::control(L'c'));
  EXPECT_EQ(wishes, (std::vector<std::string>{"close", "close", "close"}));
}

TEST_F(TerminalScreens, CtrlCEndsAlsoWhereTextIsTyped) {
  launch();
  type(L"/q");
  EXPECT_TRUE(wishes.empty());
  press(Key::control(L'c'));
  EXPECT_EQ(wishes, std::vector<std::string>{"close"});
}

TEST_F(TerminalScreens, CtrlZAndCtrlLAreForTheTerminal) {
  launch();
  press(Key::control(L'z'));
  press(Key::control(L'l'));
  EXPECT_EQ(wishes, (std::vector<std::string>{"suspend", "redraw"}));
}

TEST_F(TerminalScreens, WhatChangesAtTheSameTimeIsPaintedOnce) {
  launch();
  const unsigned before = pictures;
  receive("other");
  EXPECT_EQ(pictures, before + 1);
}

}  // namespace
}  // namespace varnel
