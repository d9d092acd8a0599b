#include "widgets/FirstSize.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(FirstSize, AScreenOfAPhoneIsTakenWhole) {
  EXPECT_TRUE(isTakenWhole({360, 640}));
  EXPECT_TRUE(isTakenWhole({640, 960}));
  EXPECT_FALSE(isTakenWhole({641, 480}));
}

TEST(FirstSize, OnALargeDesktopAWindowIsAboutAPhone) {
  EXPECT_EQ(firstSize({1920, 1080}, std::nullopt), QSize(480, 800));
}

TEST(FirstSize, OnASmallDesktopItIsNineTenthsOfWhatIsLeftBesideAFrame) {
  EXPECT_EQ(firstSize({1366, 768}, std::nullopt), QSize(480, 648));
  EXPECT_EQ(firstSize({800, 600}, std::nullopt), QSize(480, 496));
  EXPECT_EQ(firstSize({960, 540}, std::nullopt), QSize(480, 442));
}

TEST(FirstSize, TheLastSizeIsTakenAsFarAsThereIsRoomForItAndAFrame) {
  EXPECT_EQ(firstSize({1366, 768}, QSize(900, 700)), QSize(900, 700));
  EXPECT_EQ(firstSize({1366, 768}, QSize(1920, 1080)), QSize(1350, 720));
}

}  // namespace
}  // namespace varnel
