#include "programs/varnel-decode/Subscriptions.h"

#include <gmock/gmock.h>

namespace varnel {
namespace {

CaptureRecord recordOf(std::optional<std::uint8_t> subscription) {
  CaptureRecord record;
  record.subscription = subscription;
  return record;
}

TEST(Subscriptions, TheFirstThatIsMetIsChosenWithThoseThatNameNone) {
  Subscriptions subscriptions({});
  EXPECT_TRUE(subscriptions.take(recordOf({})));
  EXPECT_TRUE(subscriptions.take(recordOf(2)));
  EXPECT_FALSE(subscriptions.take(recordOf(1)));
  EXPECT_TRUE(subscriptions.take(recordOf(2)));
  EXPECT_TRUE(subscriptions.take(recordOf({})));
  EXPECT_EQ(subscriptions.counts(), (Subscriptions::Counts{{std::nullopt, 2}, {1, 1}, {2, 2}}));
  EXPECT_EQ(subscriptions.remark("a"),
            "a has records of SIM 2, which are decoded, and of SIM 1, which are not; choose by --sim");
}

TEST(Subscriptions, OfOneOrNoneThereIsNothingToSay) {
  Subscriptions subscriptions({});
  EXPECT_EQ(subscriptions.remark("a"), std::nullopt);
  subscriptions.take(recordOf({}));
  EXPECT_EQ(subscriptions.remark("a"), std::nullopt);
  subscriptions.take(recordOf(1));
  EXPECT_EQ(subscriptions.remark("a"), std::nullopt);
}

TEST(Subscriptions, WhereAllAreTakenThereIsNothingToSay) {
  Subscriptions subscriptions({}, Unasked::All);
  EXPECT_TRUE(subscriptions.take(recordOf(2)));
  EXPECT_TRUE(subscriptions.take(recordOf(1)));
  EXPECT_EQ(subscriptions.counts(), (Subscriptions::Counts{{1, 1}, {2, 1}}));
  EXPECT_EQ(subscriptions.remark("a"), std::nullopt);
}

TEST(Subscriptions, TheWantedOneIsChosenEvenWhereAllWouldBeTaken) {
  Subscriptions subscriptions(2, Unasked::All);
  EXPECT_FALSE(subscriptions.take(recordOf(1)));
  EXPECT_TRUE(subscriptions.take(recordOf(2)));
}

TEST(Subscriptions, TheWantedOneIsChosenWhicheverComesFirst) {
  Subscriptions subscriptions(2);
  EXPECT_FALSE(subscriptions.take(recordOf(1)));
  EXPECT_EQ(subscriptions.remark("a"), "a has no records of SIM 2; it has those of SIM 1");
  EXPECT_TRUE(subscriptions.take(recordOf(2)));
  EXPECT_EQ(subscriptions.remark("a"), std::nullopt);
}

TEST(Subscriptions, AWantedOneThatIsNotThereIsTold) {
  Subscriptions subscriptions(4);
  EXPECT_EQ(subscriptions.remark("a"), "a has no records of SIM 4, and names no other SIM");
  for (const std::uint8_t other : {1, 2, 3}) subscriptions.take(recordOf(other));
  EXPECT_EQ(subscriptions.remark("a"), "a has no records of SIM 4; it has those of SIM 1, SIM 2 and SIM 3");
}

}  // namespace
}  // namespace varnel
