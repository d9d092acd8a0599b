#include "widgets/RememberedSize.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/Process.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

namespace fs = std::filesystem;

class RememberedSizeTest : public testing::Test {
 protected:
  void writeFile(const std::string& text) const {
    fs::create_directories(folder);
    std::ofstream(file) << text;
  }
  std::optional<QSize> sizeAfter(const std::string& text) const {
    writeFile(text);
    return RememberedSize(folder).size();
  }

  TemporaryFolder home;
  const fs::path folder = home.path() / "state/varnel";
  const fs::path file = folder / "window-size";
};

TEST_F(RememberedSizeTest, WhatWasKeptIsThereInTheNextRun) {
  EXPECT_EQ(RememberedSize(folder).size(), std::nullopt);
  RememberedSize(folder).keep({480, 655});
  EXPECT_EQ(RememberedSize(folder).size(), QSize(480, 655));
  EXPECT_EQ(contentsOf(file), "480 655\n");
}

TEST_F(RememberedSizeTest, TheFileIsReplacedWholeAndLeavesNothingBeside) {
  writeFile("damaged");
  fs::permissions(file, fs::perms::all);
  std::ifstream former(file);
  RememberedSize(folder).keep({480, 655});
  EXPECT_EQ(std::string(std::istreambuf_iterator<char>(former), {}), "damaged") << "not written in place";
  EXPECT_EQ(contentsOf(file), "480 655\n");
  EXPECT_EQ(fs::status(file).permissions(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_EQ(std::distance(fs::directory_iterator(folder), fs::directory_iterator()), 1);
}

TEST_F(RememberedSizeTest, FolderAndFileAreTheUsersOwn) {
  RememberedSize(folder).keep({480, 655});
  EXPECT_EQ(fs::status(folder).permissions(), fs::perms::owner_all);
  EXPECT_EQ(fs::status(file).permissions(), fs::perms::owner_read | fs::perms::owner_write);
}

TEST_F(RememberedSizeTest, ADamagedFileIsIgnored) {
  for (const char* text : {"", "480", "480 ", "480 655", "480 655\n480 655\n", "480x655\n", " 480 655\n",
                           "480  655\n", "wide high\n", "480 655 \n", "4.8 6.5\n"})
    EXPECT_EQ(sizeAfter(text), std::nullopt) << text;
  EXPECT_EQ(sizeAfter("480" + std::string(1, '\0') + "655\n"), std::nullopt);
  EXPECT_EQ(sizeAfter(std::string(100000, '4')), std::nullopt);
}

TEST_F(RememberedSizeTest, AnAbsurdSizeIsIgnored) {
  for (const char* text :
       {"0 0\n", "239 655\n", "480 239\n", "-480 655\n", "480 32768\n", "99999999999 655\n"})
    EXPECT_EQ(sizeAfter(text), std::nullopt) << text;
  EXPECT_EQ(sizeAfter("240 32767\n"), QSize(240, 32767));
}

TEST_F(RememberedSizeTest, AFolderInItsPlaceIsIgnoredAndTold) {
  RecordingLog log;
  fs::create_directories(file);
  EXPECT_EQ(RememberedSize(folder).size(), std::nullopt);
  RememberedSize(folder).keep({480, 655});
  ASSERT_EQ(log.lines().size(), 1u);
  EXPECT_THAT(log.lines()[0].text,
              testing::StartsWith("Unable to keep the window's size in " + file.string() + ": "));
}

TEST_F(RememberedSizeTest, WithoutAFolderNothingIsRemembered) {
  const RememberedSize nowhere;
  nowhere.keep({480, 655});
  EXPECT_EQ(nowhere.size(), std::nullopt);
}

// The invisible screen is 800 × 800.
class WindowSizeTest : public RememberedSizeTest {
 protected:
  QSize sizeOfNewWindow() {
    const auto window = userInterface.makeWindow(userInterface.screenBounds());
    return static_cast<WindowWidget&>(*window).size();
  }

  WidgetUserInterface userInterface{{}, RememberedSize(folder)};
};

TEST_F(WindowSizeTest, AWindowComesBackInTheSizeThatItHadLast) {
  EXPECT_EQ(sizeOfNewWindow(), QSize(480, 676));
  {
    const auto window = userInterface.makeWindow(userInterface.screenBounds());
    auto& widget = static_cast<WindowWidget&>(*window);
    widget.show();
    widget.resize(600, 500);
    window->hide();
  }
  EXPECT_EQ(sizeOfNewWindow(), QSize(600, 500));
}

TEST_F(WindowSizeTest, AMaximizedWindowComesBackInTheSizeThatItHadBefore) {
  const auto window = userInterface.makeWindow(userInterface.screenBounds());
  auto& widget = static_cast<WindowWidget&>(*window);
  widget.resize(500, 400);
  widget.show();
  ASSERT_TRUE(QTest::qWaitForWindowExposed(&widget));
  widget.showMaximized();
  QCoreApplication::processEvents();
  window->hide();
  EXPECT_EQ(RememberedSize(folder).size(), QSize(500, 400));
}

TEST_F(WindowSizeTest, TheDesktopPlacesTheWindow) {
  const auto window = userInterface.makeWindow(userInterface.screenBounds());
  EXPECT_FALSE(static_cast<WindowWidget&>(*window).testAttribute(Qt::WA_Moved));
}

}  // namespace
}  // namespace varnel
