#include "widgets/PlayBar.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QMenu>
#include <QSignalSpy>
#include <QTest>

#include "tests/support/EventLoop.h"
#include "tests/support/TestWidgets.h"
#include "widgets/Colors.h"

namespace varnel {
namespace {

using Button = PlayBarState::Button;

class PlayBarTest : public testing::Test {
 protected:
  PlayBarTest() {
    bar.resize(600, bar.sizeHint().height());
    bar.setState(stream);
    bar.show();
    EXPECT_TRUE(QTest::qWaitForWindowExposed(&bar, patience_ms));
  }

  PlayBar bar;
  PlayBarState stream{.name = "walk.pcap",
                      .button = Button::Pause,
                      .place = 20'000,
                      .length = 60'000,
                      .step = 5000,
                      .date = "2023-11-14",
                      .clock = "22:13:40",
                      .progress = "0:20 / 1:00",
                      .speed = 2};
};

TEST_F(PlayBarTest, ShowsPlaceTimeAndSpeed) {
  EXPECT_EQ(bar.texts(), "2023-11-14 22:13:40 | 0:20 / 1:00");
  EXPECT_EQ(bar.slider().maximum(), 60'000);
  EXPECT_EQ(bar.slider().value(), 20'000);
  EXPECT_EQ(bar.speedButton().text(), "2×");
  EXPECT_FALSE(bar.remedyButton().isVisible());
}

TEST_F(PlayBarTest, ANarrowBarLeavesTheDateOut) {
  bar.resize(360, bar.height());
  EXPECT_EQ(bar.texts(), "22:13:40 | 0:20 / 1:00");
  EXPECT_GE(bar.slider().width(), 60);
}

TEST_F(PlayBarTest, ItsFirstButtonDoesWhatItShows) {
  QSignalSpy pause(&bar, &PlayBar::pauseWanted), play(&bar, &PlayBar::playWanted),
      again(&bar, &PlayBar::againWanted);
  QTest::mouseClick(&bar.playButton(), Qt::LeftButton);
  stream.button = Button::Play;
  bar.setState(stream);
  EXPECT_EQ(bar.playButton().accessibleName(), "Play");
  QTest::keyClick(&bar.playButton(), Qt::Key_Return);
  stream.button = Button::Again;
  bar.setState(stream);
  QTest::keyClick(&bar.playButton(), Qt::Key_Space);
  EXPECT_EQ(pause.size(), 1);
  EXPECT_EQ(play.size(), 1);
  EXPECT_EQ(again.size(), 1);
}

TEST_F(PlayBarTest, AClickOnTheSliderJumpsThere) {
  QSignalSpy jumps(&bar, &PlayBar::jumpWanted);
  QTest::mouseClick(&bar.slider(), Qt::LeftButton, {}, bar.slider().rect().center());
  ASSERT_EQ(jumps.size(), 1);
  EXPECT_NEAR(jumps[0][0].toInt(), 30'000, 1000);
}

TEST_F(PlayBarTest, WhileTheSliderIsMovedStatesDoNotMoveIt) {
  QSignalSpy jumps(&bar, &PlayBar::jumpWanted), moves(&bar, &PlayBar::dragged);
  const QPoint middle = bar.slider().rect().center();
  QTest::mousePress(&bar.slider(), Qt::LeftButton, {}, middle);
  QTest::mouseMove(&bar.slider(), middle + QPoint(40, 0));
  EXPECT_GE(moves.size(), 1);
  const int moved = bar.slider().value();
  EXPECT_GT(moved, 31'000);
  bar.setProgress("there");
  stream.place = 21'000;
  bar.setState(stream);
  EXPECT_EQ(bar.slider().value(), moved);
  EXPECT_EQ(bar.texts(), "2023-11-14 22:13:40 | there");
  EXPECT_EQ(jumps.size(), 0);
  QTest::mouseRelease(&bar.slider(), Qt::LeftButton, {}, middle + QPoint(40, 0));
  ASSERT_EQ(jumps.size(), 1);
  EXPECT_EQ(jumps[0][0].toInt(), moved);
  bar.setState(stream);
  EXPECT_EQ(bar.slider().value(), 21'000);
}

TEST_F(PlayBarTest, SeveralKeysAreOneJump) {
  QSignalSpy jumps(&bar, &PlayBar::jumpWanted);
  bar.slider().setFocus();
  for (int i = 0; i < 3; ++i) QTest::keyClick(&bar.slider(), Qt::Key_Right);
  EXPECT_EQ(jumps.size(), 0);
  ASSERT_TRUE(runUntil([&] { return !jumps.empty(); }));
  EXPECT_EQ(jumps[0][0].toInt(), 35'000);
}

TEST_F(PlayBarTest, EscapeLeavesTheBar) {
  QSignalSpy left(&bar, &PlayBar::keyboardLeft);
  QTest::keyClick(&bar.slider(), Qt::Key_Escape);
  EXPECT_EQ(left.size(), 1);
}

TEST_F(PlayBarTest, ASpeedIsChosenFromAMenu) {
  QSignalSpy speeds(&bar, &PlayBar::speedWanted);
  QTest::mouseClick(&bar.speedButton(), Qt::LeftButton);
  auto* const menu = bar.findChild<QMenu*>();
  ASSERT_NE(menu, nullptr);
  EXPECT_EQ(menu->actions()[2]->text(), "2×");
  EXPECT_TRUE(menu->actions()[2]->isChecked());
  EXPECT_EQ(menu->actions()[0]->text(), "0.5×");
  menu->actions()[0]->trigger();
  ASSERT_EQ(speeds.size(), 1);
  EXPECT_EQ(speeds[0][0].toDouble(), 0.5);
}

TEST_F(PlayBarTest, AMessageStandsInPlaceOfEverythingButItsRemedy) {
  QSignalSpy remedies(&bar, &PlayBar::remedyWanted);
  PlayBarState ended{.name = "walk.pcap"};
  ended.message = "The server has ended";
  ended.remedy = "Start again";
  bar.setState(ended);
  EXPECT_EQ(bar.texts(), "The server has ended");
  EXPECT_FALSE(bar.slider().isVisible());
  EXPECT_FALSE(bar.playButton().isVisible());
  EXPECT_EQ(bar.accessibleDescription(), "The server has ended");
  QTest::mouseClick(&bar.remedyButton(), Qt::LeftButton);
  EXPECT_EQ(remedies.size(), 1);
}

TEST_F(PlayBarTest, AButtonThatGoesPassesTheKeyboardOn) {
  QSignalSpy departures(&bar, &PlayBar::keyboardLeft);
  PlayBarState ended{.name = "walk.pcap"};
  ended.message = "The server has ended";
  ended.remedy = "Start again";
  bar.activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&bar, patience_ms));
  bar.playButton().setFocus();
  bar.setState(ended);
  EXPECT_TRUE(bar.remedyButton().hasFocus());
  bar.setState(stream);
  EXPECT_TRUE(bar.playButton().hasFocus());
  EXPECT_EQ(departures.size(), 0);
}

TEST_F(PlayBarTest, WithoutAButtonToPlayTheKeyboardLeavesTheBar) {
  QSignalSpy departures(&bar, &PlayBar::keyboardLeft);
  PlayBarState ended{.name = "walk.pcap"};
  ended.message = "The server has ended";
  ended.remedy = "Start again";
  bar.setState(ended);
  bar.activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&bar, patience_ms));
  bar.remedyButton().setFocus();
  bar.setState({.name = "walk.pcap"});
  EXPECT_EQ(departures.size(), 1);
}

// At least 3 to 1 is asked for (WCAG 2.1, contrast of what is not text).
TEST_F(PlayBarTest, TheGrooveIsSeenOnWhiteAndOnBlack) {
  for (const auto& [ground, text] : {std::pair(Qt::white, Qt::black), std::pair(Qt::black, Qt::white)}) {
    QPalette palette;
    for (const auto role : {QPalette::Window, QPalette::Base}) palette.setColor(role, QColor(ground));
    for (const auto role : {QPalette::WindowText, QPalette::Text}) palette.setColor(role, QColor(text));
    bar.setPalette(palette);
    bar.slider().setPalette(palette);
    const QRect place(bar.slider().mapTo(&bar, QPoint()), bar.slider().size());
    const QImage picture = bar.grab(place).toImage();
    const QColor groove = picture.pixelColor(picture.width() * 4 / 5, picture.height() / 2);
    EXPECT_GE(contrast(groove, QColor(ground)), 3);
  }
}

}  // namespace
}  // namespace varnel
