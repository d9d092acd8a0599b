#include "programs/varnel/WindowView.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QApplication>
#include <QTest>
#include <QTimer>
#include <csignal>
#include <cstdlib>
#include <functional>
#include <set>
#include <string>

#include "tests/support/Process.h"
#include "widgets/RowMenu.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;
using testing::HasSubstr;
using testing::UnorderedElementsAre;

// What the user does as soon as the window is open.
std::function<void(QWidget& window)> deed;

void awaitWindow() {
  QTimer::singleShot(10ms, [] {
    for (QWidget* const window : QApplication::topLevelWidgets()) {
      if (window->isActiveWindow()) return deed(*window);
    }
    awaitWindow();
  });
}
Q_COREAPP_STARTUP_FUNCTION(awaitWindow)

// Runs the viewer from start to end, without a server, on an invisible screen.
class WindowViewTest : public testing::Test {
 protected:
  WindowViewTest() {
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
    ::setenv("XDG_STATE_HOME", _state.path().c_str(), 1);
  }

  int statusAfter(std::function<void(QWidget& window)> whatIsDone) const {
    deed = std::move(whatIsDone);
    Options options;
    options.deviceRoot = _device.path().string();
    options.runtimeFolder = _runtime.path().string();
    int argumentCount = 1;
    std::string name = programName;
    char* arguments[] = {name.data(), nullptr};
    return viewInWindow(argumentCount, arguments, options, {.version = "1.0", .buildDate = "today"});
  }
  void expectThePreferenceBack() const {
    EXPECT_THAT(contentsOf(_device.path() / "var/mobile/Library/Preferences/com.orvane.dockhall.plist"),
                HasSubstr("DHShowGSMRSSI"));
  }

 private:
  TemporaryFolder _runtime;
  TemporaryFolder _device;

 protected:
  TemporaryFolder _state;
};

TEST_F(WindowViewTest, ClosingTheWindowEndsTheViewerAndPutsThePreferenceBack) {
  EXPECT_EQ(statusAfter([](QWidget& window) { window.close(); }), 0);
  expectThePreferenceBack();
}

TEST_F(WindowViewTest, ControlQEndsTheViewerAndPutsThePreferenceBack) {
  EXPECT_EQ(statusAfter([](QWidget& window) { QTest::keyClick(&window, Qt::Key_Q, Qt::ControlModifier); }),
            0);
  expectThePreferenceBack();
}

TEST_F(WindowViewTest, AHangUpEndsTheViewerAndPutsThePreferenceBack) {
  EXPECT_EQ(statusAfter([](QWidget&) { ::kill(::getpid(), SIGHUP); }), 0);
  expectThePreferenceBack();
}

TEST_F(WindowViewTest, TheWindowsSizeIsKeptForTheNextRun) {
  statusAfter([](QWidget& window) {
    window.resize(500, 450);
    window.close();
  });
  EXPECT_EQ(contentsOf(_state.path() / "varnel/window-size"), "500 450\n");
}

TEST_F(WindowViewTest, WithoutADisplayOnlyWhatAppliesCanBeChosenInTheMenu) {
  std::set<std::string> offered;
  statusAfter([&offered](QWidget& window) {
    auto& menu = *window.findChild<RowMenu*>();
    menu.open();
    for (const QAction* const action : menu.menu()->actions())
      if (!action->isSeparator() && action->isEnabled()) offered.insert(action->text().toStdString());
    menu.menu()->close();
    window.close();
  });
  EXPECT_THAT(offered, UnorderedElementsAre("Find a row", "Help", "Open a file", "Start over", "Quit"));
}

}  // namespace
}  // namespace varnel
