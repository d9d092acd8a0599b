#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QClipboard>
#include <QGuiApplication>
#include <QLabel>
#include <QMenu>
#include <QTextBrowser>
#include <algorithm>
#include <filesystem>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "app/VarnelApp.h"
#include "base/Log.h"
#include "base/PropertyList.h"
#include "host/CaptureWriter.h"
#include "host/captures/Capture.h"
#include "programs/varnel/HostServices.h"
#include "programs/varnel/RowCommands.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/EventLoop.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/Process.h"
#include "tests/support/TestWidgets.h"
#include "widgets/HelpPage.h"
#include "widgets/RowMenu.h"
#include "widgets/SearchPage.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::MatchesRegex;
using testing::SizeIs;
using Texts = std::vector<std::string>;

constexpr std::chrono::seconds patience = 60s;
constexpr const char* measurements = "Serving Cell Measurements";
constexpr const char* contexts = "PDP Context Info";

std::string textAt(const Value& dictionary, std::string_view key) {
  const std::string* found = dictionary.dictionary()->get(key).string();
  return found ? *found : "(none)";
}

// The viewer with its window in this process, on a device that allows snapshots, and a real server in another
// process.
class WindowEndToEnd : public testing::Test {
 protected:
  WindowEndToEnd() {
    fs::create_directories(_device.path() /
                           "OrvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
    fs::create_directories(_logs);
    _userInterface.setWindowObserver([this](WindowWidget& window) { _rowCommands.addTo(window); });
  }
  ~WindowEndToEnd() override { _app.applicationWillTerminate(); }

  // Returns when the server can be reached.
  void startServer(Texts source) {
    fs::remove(_serverSocket);  // left by a server that was killed
    source.insert(source.end(), {"--runtime-dir", _runtime.path(), "--record", _record, "--overwrite"});
    _server = std::make_unique<Process>(VARNEL_TELEPHONYD_PROGRAM, source);
    ASSERT_TRUE(eventually([this] { return fs::exists(_serverSocket); }, patience)) << _server->error();
  }
  void simulate(const std::string& seed) { startServer({"--simulate", "kalvi-lte", "--seed", seed}); }
  // Returns when the viewer has noticed it and has closed its port.
  void killServer() {
    _server->signal(SIGKILL);
    ASSERT_TRUE(runUntil([this] { return !fs::exists(_viewerSocket); }, patience));
  }
  // A capture of these messages, each the given number of seconds after the first.
  std::string captureOf(const std::vector<std::pair<std::int64_t, Bytes>>& messages) const {
    const std::string path = _runtime.file("capture.pcap");
    CaptureWriter writer(path);
    for (const auto& [seconds, message] : messages) writer.write({1709294709 + seconds, 0}, message);
    return path;
  }
  std::vector<fs::path> snapshots() const { return {fs::directory_iterator(_logs), {}}; }
  std::vector<Bytes> sentMessages() const {
    const auto record = openCapture(_record);
    std::vector<Bytes> messages;
    for (CaptureRecord sent; record->next(sent);)
      messages.emplace_back(sent.message.begin(), sent.message.end());
    return messages;
  }

  void launch() {
    _app.applicationDidFinishLaunching();
    EXPECT_EQ(status(), "Connecting");
    EXPECT_THAT(rows(), IsEmpty());
    window().setGeometry(0, 0, 1920, 1080);
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window(), patience_ms));
  }
  WindowWidget& window() { return static_cast<WindowWidget&>(*_app.window()); }
  NavigationWidget& stack() { return *window().stack(); }
  PaneWidget& pane() { return stack().topPane(); }
  std::string title() { return pane().header().title().toStdString(); }
  std::string status() { return pane().toolbar().findChild<QLabel*>()->text().toStdString(); }
  bool isUpdated() { return status().starts_with("Updated"); }
  Texts rows() {
    Texts all;
    for (const RowWidget* row : pane().tableWidget().visibleRows())
      all.push_back(row->description().toStdString());
    return all;
  }
  bool hasRow(const std::string& description) { return std::ranges::count(rows(), description) > 0; }
  // Two updates are two seconds apart, and the status shows the seconds.
  bool waitForNextUpdate() {
    return runUntil([this, former = status()] { return isUpdated() && status() != former; }, patience);
  }

  std::string currentRow() {
    const RowWidget* const row = pane().tableWidget().currentRow();
    return row ? row->description().toStdString() : "(none)";
  }
  static std::string copied() { return QGuiApplication::clipboard()->text().toStdString(); }
  // Opens the search, and returns when this has been found.
  void find(const QString& words, const std::string& value) {
    press(Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), words);
    ASSERT_TRUE(runUntil(
        [&] {
          const auto* const page = qobject_cast<SearchPage*>(window().page());
          return page && page->currentRow() && page->currentRow()->value.starts_with(value);
        },
        patience));
  }
  static void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
  }
  void openWithKeys(const std::string& row) {
    const Texts all = rows();
    const auto found = std::ranges::find(all, row);
    ASSERT_NE(found, all.end()) << testing::PrintToString(all);
    press(Qt::Key_Home);
    for (auto above = all.begin(); above != found; ++above) press(Qt::Key_Down);
    press(Qt::Key_Return);
    ASSERT_EQ(title(), row);
  }
  void openWithMouse(const std::string& row) {
    for (const RowWidget* shown : pane().tableWidget().visibleRows()) {
      if (shown->description().toStdString() != row) continue;
      QTest::mouseClick(pane().tableWidget().viewport(), Qt::LeftButton, {}, shown->geometry().center());
      break;
    }
    ASSERT_EQ(title(), row);
  }
  bool showsMeasurements() {
    return std::ranges::any_of(rows(), [](const auto& row) { return row.starts_with("Average RSRP: -"); });
  }
  void openMeasurements() {
    ASSERT_TRUE(runUntil([this] { return isUpdated() && hasRow(measurements); }, patience)) << status();
    openWithKeys(measurements);
    ASSERT_TRUE(runUntil([this] { return showsMeasurements(); }, patience)) << testing::PrintToString(rows());
  }
  void expectLivingRows() {
    EXPECT_TRUE(runUntil([this, former = rows()] { return rows() != former; }, patience));
  }

 private:
  Options viewerOptions() const {
    Options options;
    options.deviceRoot = _device.path().string();
    options.runtimeFolder = _runtime.path().string();
    options.logLevel = logErrorPriority;
    return options;
  }

  TemporaryFolder _runtime;
  TemporaryFolder _device;
  const fs::path _serverSocket = _runtime.path() / "com.orvane.TelephonyServer";
  const fs::path _viewerSocket = _runtime.path() / "com.orvane.BasebandStateReport.LogChannel";
  const std::string _record = _runtime.file("record.pcap");
  const fs::path _logs = _device.path() / "var/mobile/Library/Logs/CrashReporter";
  std::unique_ptr<Process> _server;
  const ApplicationInfo _application{.version = "1.0", .buildDate = "Mar 01 2024 12:05"};
  HostServices _services{viewerOptions(), _application};
  WidgetUserInterface _userInterface{{.startOver = [this] { _app.startOver(); }}};
  ValueHistory _history;
  const RowAnswers _answers{_services.model().generator.resources, _services.model().generator.clock,
                            _history};
  VarnelApp _app{{.model = _services.model(),
                  .files = _services.files(),
                  .preferences = _services.preferences(),
                  .userInterface = _userInterface,
                  .history = &_history}};
  RowCommands _rowCommands{_app, _answers};
};

TEST_F(WindowEndToEnd, TheDisplayOutlivesTheServerUntilTheUserStartsOver) {
  simulate("7");
  launch();
  openMeasurements();
  EXPECT_THAT(status(), MatchesRegex("Updated [0-9]{4}-[0-9]{2}-[0-9]{2} at [0-9]{2}:[0-9]{2}:[0-9]{2}"));
  expectLivingRows();

  killServer();
  ASSERT_TRUE(runUntil([this] { return status() == "Connecting..."; }, patience)) << status();
  EXPECT_TRUE(showsMeasurements());
  const Texts last = rows();
  press(Qt::Key_Escape);
  EXPECT_EQ(status(), "Connecting...");
  openWithKeys(measurements);
  EXPECT_EQ(status(), "Connecting...");
  EXPECT_EQ(rows(), last);

  simulate("8");
  ASSERT_TRUE(waitForNextUpdate()) << status();
  const Texts kept = rows();
  EXPECT_TRUE(showsMeasurements());
  ASSERT_TRUE(waitForNextUpdate()) << status();
  EXPECT_EQ(rows(), kept) << "the sections belong to the link that is gone";

  press(Qt::Key_R, Qt::ControlModifier);
  EXPECT_THAT(stack().controllers(), SizeIs(1));
  EXPECT_EQ(title(), "Varnel");
  EXPECT_EQ(status(), "Connecting");
  EXPECT_THAT(rows(), IsEmpty());
  openMeasurements();
  EXPECT_NE(rows(), kept);
  expectLivingRows();
}

TEST_F(WindowEndToEnd, APaneGoesWithTheContextThatItShows) {
  const Value internet = dictionaryOf({{"APN", "internet"}, {"State", "Active"}});
  const Value ims = dictionaryOf({{"APN", "ims"}, {"State", "Active"}});
  const Bytes both = serverMessage(0xFF0002, Value::ofArray({internet, ims}));
  const Bytes one = serverMessage(0xFF0002, Value::ofArray({internet}));
  // Both for three seconds, then only one for three seconds.
  startServer(
      {"--replay", captureOf({{0, both}, {3, one}, {5, one}}), "--technology", "kalvi-lte", "--loop"});
  launch();
  ASSERT_TRUE(runUntil([this] { return hasRow(contexts); }, patience)) << status();
  openWithMouse(contexts);
  ASSERT_TRUE(runUntil([this] { return hasRow("1"); }, patience)) << status();
  openWithMouse("1");
  EXPECT_THAT(stack().controllers(), SizeIs(3));
  EXPECT_THAT(rows(), ElementsAre("APN: ims", "State: Active"));

  ASSERT_TRUE(runUntil([this] { return stack().controllers().size() < 3; }, patience)) << status();
  EXPECT_EQ(title(), contexts);
  EXPECT_THAT(rows(), ElementsAre("0"));
  openWithKeys("0");
  EXPECT_THAT(rows(), ElementsAre("APN: internet", "State: Active"));
}

TEST_F(WindowEndToEnd, ASnapshotTellsWhatTheServerSent) {
  simulate("7");
  launch();
  openMeasurements();
  press(Qt::Key_S, Qt::ControlModifier);
  ASSERT_NE(stack().modalScreen(), nullptr);
  QTest::keyClicks(QApplication::focusWidget(), "on the stairs");
  press(Qt::Key_S, Qt::ControlModifier);
  ASSERT_TRUE(runUntil([this] { return stack().modalScreen() == nullptr; }, patience));
  EXPECT_EQ(title(), measurements);

  const std::vector<fs::path> files = snapshots();
  ASSERT_THAT(files, SizeIs(1));
  EXPECT_THAT(files[0].filename().string(), MatchesRegex("VarnelSnapshot-[0-9]+\\.varnel"));
  EXPECT_EQ(fs::status(files[0]).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  const std::string text = contentsOf(files[0]);
  const auto snapshot = readPropertyList(Bytes(text.begin(), text.end()));
  ASSERT_TRUE(snapshot && snapshot->dictionary()) << text;
  EXPECT_EQ(textAt(*snapshot, "Description"), "on the stairs");
  const Array* items = snapshot->dictionary()->get("Data").array();
  ASSERT_TRUE(items && !items->empty() && items->back().dictionary()) << text;
  const Bytes* log = items->back().dictionary()->get("DLF").data();
  ASSERT_TRUE(log) << text;
  EXPECT_EQ(textAt(items->back(), "Description"), "DLF binary (" + std::to_string(log->size()) + " bytes)");
  EXPECT_TRUE(std::ranges::any_of(sentMessages(), [&](const Bytes& message) {
    return std::search(log->begin(), log->end(), message.begin(), message.end()) != log->end();
  })) << text;
}

TEST_F(WindowEndToEnd, FindGoesToARowAnywhereByNameAndValue) {
  simulate("7");
  launch();
  ASSERT_TRUE(runUntil([this] { return isUpdated() && hasRow(measurements); }, patience));
  find("serving average rsrp", "-");
  const Texts before = {qobject_cast<SearchPage*>(window().page())->currentRow()->value};
  EXPECT_TRUE(runUntil(
      [&] { return qobject_cast<SearchPage*>(window().page())->currentRow()->value != before[0]; }, patience))
      << "results follow the refreshes";
  press(Qt::Key_Return);
  EXPECT_FALSE(window().page());
  EXPECT_EQ(title(), measurements);
  EXPECT_THAT(currentRow(), testing::StartsWith("Average RSRP: -"));

  press(Qt::Key_Slash);
  ASSERT_TRUE(window().page());
  press(Qt::Key_Escape);
  EXPECT_FALSE(window().page());
  EXPECT_THAT(currentRow(), testing::StartsWith("Average RSRP: -")) << "Escape leaves everything as it was";
  find("dbm", "-");
  EXPECT_GT(qobject_cast<SearchPage*>(window().page())->findChild<QListView*>()->model()->rowCount(), 3);
}

TEST_F(WindowEndToEnd, TheRowWithTheFocusIsCopiedInEveryForm) {
  simulate("7");
  launch();
  openMeasurements();
  killServer();  // so that the values stand
  press(Qt::Key_Home);
  while (!currentRow().starts_with("Average RSRP: ")) press(Qt::Key_Down);
  const std::string value = currentRow().substr(std::string("Average RSRP: ").size());
  press(Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(copied(), value);
  press(Qt::Key_C, Qt::ControlModifier | Qt::ShiftModifier);
  EXPECT_EQ(copied(), "Average RSRP\t" + value);
  const auto copyOf = [this](const char* name) {
    for (QAction* const action : window().actions()) {
      if (action->text() == name) action->trigger();
    }
    return copied();
  };
  EXPECT_EQ(copyOf("Copy the path"), "/Serving Cell Measurements/Average RSRP");
  EXPECT_THAT(copyOf("Copy the section as text"), testing::ContainsRegex("Average RSRP +" + value));
  EXPECT_THAT(copyOf("Copy the section as JSON"), testing::HasSubstr("\"Average RSRP\":\"" + value + "\""));
}

TEST_F(WindowEndToEnd, WithoutARowItsValueIsNotCopiedAndTheMenuDoesNotOfferIt) {
  simulate("7");
  launch();
  ASSERT_TRUE(runUntil([this] { return isUpdated() && hasRow(measurements); }, patience));
  const auto offered = [this] {
    Texts texts;
    for (QAction* const action : window().actions())
      if (action->text().startsWith("Copy") && window().offers(*action))
        texts.push_back(action->text().toStdString());
    return texts;
  };
  const Texts ofSection{"Copy the section as text", "Copy the section as JSON", "Copy the path"};
  EXPECT_EQ(offered(), ofSection);
  QGuiApplication::clipboard()->setText("before");
  press(Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(copied(), "before");
  press(Qt::Key_Down);
  EXPECT_THAT(offered(), SizeIs(5));
  press(Qt::Key_C, Qt::ControlModifier | Qt::ShiftModifier);
  EXPECT_EQ(copied(), pane().tableWidget().currentRow()->name().toStdString());
}

TEST_F(WindowEndToEnd, TheMenuBelongsToTheRowUnderTheMouseAndHasEverything) {
  simulate("7");
  launch();
  ASSERT_TRUE(runUntil([this] { return isUpdated() && hasRow(measurements); }, patience));
  auto* const rowMenu = window().findChild<RowMenu*>();
  ASSERT_TRUE(rowMenu);
  const RowWidget* const third = pane().tableWidget().visibleRows().at(2);
  const QPoint place = third->geometry().center();
  QContextMenuEvent wish(QContextMenuEvent::Mouse, place,
                         pane().tableWidget().viewport()->mapToGlobal(place));
  QApplication::sendEvent(pane().tableWidget().viewport(), &wish);
  ASSERT_TRUE(rowMenu->menu());
  EXPECT_EQ(currentRow(), third->description().toStdString());
  EXPECT_TRUE(third->emphasis().hasFocusFrame);
  for (QAction* const action : window().actions()) {
    EXPECT_TRUE(action->text() == "Menu of the row" || action->text().isEmpty() ||
                rowMenu->menu()->actions().contains(action))
        << action->text().toStdString();
  }
  QTest::keyClick(rowMenu->menu(), Qt::Key_Escape);
  EXPECT_TRUE(runUntil([&] { return !rowMenu->menu(); }, patience));
  window().activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&window(), patience_ms));
  press(Qt::Key_F10, Qt::ShiftModifier);
  ASSERT_TRUE(rowMenu->menu());
  EXPECT_EQ(currentRow(), third->description().toStdString());
  rowMenu->menu()->close();
}

TEST_F(WindowEndToEnd, HelpBeginsWithTheRowAndHasEveryKey) {
  simulate("7");
  launch();
  openMeasurements();
  press(Qt::Key_Home);
  while (!currentRow().starts_with("Average RSRP: ")) press(Qt::Key_Down);
  press(Qt::Key_Question);
  const auto* const page = qobject_cast<HelpPage*>(window().page());
  ASSERT_TRUE(page);
  const std::string sheet = page->toPlainText().toStdString();
  EXPECT_THAT(sheet, testing::HasSubstr("This row: Serving Cell Measurements > Average RSRP\n"));
  EXPECT_THAT(sheet, testing::HasSubstr("3GPP TS 36.214"));
  for (const QAction* const action : window().actions()) {
    for (const QKeySequence& key : action->shortcuts())
      EXPECT_THAT(sheet, testing::HasSubstr(key.toString(QKeySequence::NativeText).toStdString()));
  }
  press(Qt::Key_F1);
  EXPECT_FALSE(window().page()) << "the same key closes it";
}

}  // namespace
}  // namespace varnel
