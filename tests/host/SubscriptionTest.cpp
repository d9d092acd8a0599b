#include "host/Subscription.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "host/SubscriptionPorts.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(Subscription, IsTheByteBehindALeading0x81) {
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 2, 1, 13}), 2);
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 255}), 255);
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 0, 1, 13}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{1, 0x81, 2}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{0x81}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{}), std::nullopt);
}

TEST(SubscriptionFilter, TakesTheOneThatIsWantedAndWhatNamesNone) {
  std::vector<std::string> told;
  SubscriptionFilter filter(2, "walk", [&](const std::string& line) { told.push_back(line); });
  EXPECT_FALSE(filter.takes(1));
  EXPECT_TRUE(filter.takes(2));
  EXPECT_TRUE(filter.takes(std::nullopt));
  EXPECT_FALSE(filter.takes(3));
  EXPECT_EQ(filter.leftOut(), 2u);
  EXPECT_THAT(told, IsEmpty()) << "as it was asked for";
}

TEST(SubscriptionFilter, TakesTheFirstUnlessOneIsWantedAndTellsOfTheOtherOnce) {
  std::vector<std::string> told;
  SubscriptionFilter filter({}, "walk", [&](const std::string& line) { told.push_back(line); });
  EXPECT_TRUE(filter.takes(std::nullopt));
  EXPECT_TRUE(filter.takes(2));
  EXPECT_THAT(told, IsEmpty());
  EXPECT_FALSE(filter.takes(1));
  EXPECT_FALSE(filter.takes(1));
  EXPECT_TRUE(filter.takes(2));
  EXPECT_EQ(filter.leftOut(), 2u);
  EXPECT_THAT(told, ElementsAre("walk has messages of subscriptions 2 and 1; those of 2 are taken, and "
                                "--sim 1 takes the others"));
}

// Makes a port whose messages a test brings itself.
class HandedPorts final : public MessagePorts {
 public:
  LocalPortCreation createLocalPort(std::string_view name, LocalPort::MessageHandler handler) override {
    lastName = name;
    deliver = std::move(handler);
    return {nullptr, true};
  }
  std::unique_ptr<RemotePort> createRemotePort(std::string_view name) override {
    lastName = name;
    return nullptr;
  }

  std::string lastName;
  LocalPort::MessageHandler deliver;
};

TEST(SubscriptionPorts, DeliverOneSubscriptionAndWhatNamesNone) {
  HandedPorts handed;
  SubscriptionPorts ports(handed, 2);
  std::vector<Bytes> delivered;
  const auto created = ports.createLocalPort("log", [&](std::int32_t identifier, ByteView data) {
    delivered.emplace_back(data.begin(), data.end());
    return std::optional<Bytes>(Bytes{static_cast<std::uint8_t>(identifier)});
  });
  EXPECT_TRUE(created.alreadyExists);
  EXPECT_EQ(handed.lastName, "log");
  const Bytes first{0x81, 1, 1, 13}, second{0x81, 2, 1, 13}, unnamed{0x81, 0, 1, 13}, plain{1, 13};
  EXPECT_EQ(handed.deliver(7, first), std::nullopt);
  EXPECT_EQ(handed.deliver(7, second), Bytes{7});
  EXPECT_EQ(handed.deliver(8, unnamed), Bytes{8});
  EXPECT_EQ(handed.deliver(9, plain), Bytes{9});
  EXPECT_THAT(delivered, ElementsAre(second, unnamed, plain));
  EXPECT_EQ(ports.createRemotePort("commands"), nullptr);
  EXPECT_EQ(handed.lastName, "commands");
}

}  // namespace
}  // namespace varnel
