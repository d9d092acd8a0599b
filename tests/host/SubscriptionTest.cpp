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

TEST(Subscription, IsTheByteBehindALeading0x81) {
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 2, 1, 13}), 2);
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 255}), 255);
  EXPECT_EQ(subscriptionOf(Bytes{0x81, 0, 1, 13}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{1, 0x81, 2}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{0x81}), std::nullopt);
  EXPECT_EQ(subscriptionOf(Bytes{}), std::nullopt);
}

TEST(SubscriptionFilter, TakesTheOneThatIsWantedAndWhatNamesNone) {
  SubscriptionFilter filter(2);
  EXPECT_FALSE(filter.takes(1));
  EXPECT_TRUE(filter.takes(2));
  EXPECT_TRUE(filter.takes(std::nullopt));
  EXPECT_FALSE(filter.takes(3));
  EXPECT_EQ(filter.taken(), 2);
}

TEST(SubscriptionFilter, TakesAllOfAllRadiosUnlessOneIsWanted) {
  SubscriptionFilter all({}, unaskedOf("all-radios"));
  EXPECT_TRUE(all.takes(2));
  EXPECT_TRUE(all.takes(1));
  EXPECT_TRUE(all.takes({}));
  EXPECT_EQ(all.taken(), std::nullopt);
  SubscriptionFilter one(2, unaskedOf("all-radios"));
  EXPECT_FALSE(one.takes(1));
  EXPECT_TRUE(one.takes(2));
  EXPECT_EQ(unaskedOf("kalvi-lte"), Unasked::First);
}

TEST(SubscriptionFilter, TakesTheFirstUnlessOneIsWanted) {
  SubscriptionFilter filter({});
  EXPECT_TRUE(filter.takes(std::nullopt));
  EXPECT_EQ(filter.taken(), std::nullopt);
  EXPECT_TRUE(filter.takes(2));
  EXPECT_FALSE(filter.takes(1));
  EXPECT_TRUE(filter.takes(2));
  EXPECT_EQ(filter.taken(), 2);
}

// Makes a port whose messages come from the test.
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

TEST(Subscription, SeveralAreNamedInARow) {
  EXPECT_EQ(subscriptionNames(Bytes{1}), "SIM 1");
  EXPECT_EQ(subscriptionNames(Bytes{1, 2}), "SIM 1 and SIM 2");
  EXPECT_EQ(subscriptionNames(Bytes{1, 2, 255}), "SIM 1, SIM 2 and SIM 255");
}

TEST(SubscriptionPorts, DeliverOneSubscriptionAndWhatNamesNone) {
  HandedPorts handed;
  LinkMonitor monitor("/run/varnel");
  SubscriptionPorts ports(handed, monitor, 2);
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
  EXPECT_EQ(ports.messagesTaken(), 3u);
  EXPECT_EQ(ports.createRemotePort("commands"), nullptr);
  EXPECT_EQ(handed.lastName, "commands");
  EXPECT_EQ(monitor.linkReport().mixture, "");
}

// A message as long as a header, of this subscription.
Bytes headerOf(std::uint8_t subscription) { return {0x81, subscription, 1, 13, 0, 0, 0, 0, 0, 0, 0, 0, 0}; }

TEST(SubscriptionPorts, DeliverAllAndTellOfAMixtureUnlessOneIsWanted) {
  HandedPorts handed;
  LinkMonitor monitor("/run/varnel");
  SubscriptionPorts ports(handed, monitor, {});
  std::vector<Bytes> delivered;
  ports.createLocalPort("log", [&](std::int32_t identifier, ByteView data) {
    delivered.emplace_back(data.begin(), data.end());
    return std::optional<Bytes>(Bytes{static_cast<std::uint8_t>(identifier)});
  });
  const Bytes first = headerOf(1), second = headerOf(2), unnamed = headerOf(0), plain{1, 13};
  EXPECT_EQ(handed.deliver(0, second), Bytes{0});
  EXPECT_EQ(handed.deliver(0, unnamed), Bytes{0});
  EXPECT_EQ(handed.deliver(0, plain), Bytes{0});
  EXPECT_EQ(handed.deliver(0, second), Bytes{0});
  EXPECT_EQ(monitor.linkReport().mixture, "");
  EXPECT_EQ(handed.deliver(0, first), Bytes{0});
  EXPECT_THAT(delivered, ElementsAre(second, unnamed, plain, second, first));
  const std::string told =
      "The display mixes what the modems of SIM 1 and SIM 2 send; to see one of them alone, start varnel "
      "with --sim 1";
  EXPECT_EQ(monitor.linkReport().mixture, told);
  EXPECT_EQ(handed.deliver(0, second), Bytes{0});
  EXPECT_EQ(monitor.linkReport().mixture, told);
  // Another link may be that of another phone.
  monitor.linkIsOpen();
  EXPECT_EQ(monitor.linkReport().mixture, "");
  EXPECT_EQ(handed.deliver(0, first), Bytes{0});
  EXPECT_EQ(monitor.linkReport().mixture, "");
}

TEST(SubscriptionPorts, DeliverWhatIsNotShownButDoNotCountItAsMixed) {
  HandedPorts handed;
  LinkMonitor monitor("/run/varnel");
  SubscriptionPorts ports(handed, monitor, {});
  std::size_t delivered = 0;
  ports.createLocalPort("log", [&](std::int32_t, ByteView) {
    ++delivered;
    return std::nullopt;
  });
  handed.deliver(0, headerOf(1));
  handed.deliver(1, headerOf(2));
  const Bytes twelveBytes{0x81, 2, 1, 13, 0, 0, 0, 0, 0, 0, 0, 0};
  handed.deliver(0, twelveBytes);
  EXPECT_EQ(delivered, 3u);
  EXPECT_EQ(monitor.linkReport().mixture, "");
  handed.deliver(0, headerOf(2));
  EXPECT_NE(monitor.linkReport().mixture, "");
}

}  // namespace
}  // namespace varnel
