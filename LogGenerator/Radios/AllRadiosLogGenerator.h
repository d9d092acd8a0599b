#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>

#include "LogGenerator/KLVLogGenerator.h"
#include "LogGenerator/Radios/RadioGroups.h"

namespace varnel {

/// The generator of modems with several radios. Its display has a group per radio; a group that has shown
/// nothing yet is left out. What is said for one subscription (the SIM card that the prefix of a message
/// names) is in groups of its own, under "SIM 1", "SIM 2", and so on.
///
/// The decoders go on with the display that an earlier generator of this kind has left in the state. A
/// generator works with one state only.
class AllRadiosLogGenerator final : public KLVLogGenerator {
 public:
  /// Messages that name yet another subscription are not decoded.
  static constexpr std::size_t mostSubscriptions = 8;

  explicit AllRadiosLogGenerator(const Services& services);
  /// Writes what came since the last display, so that the next generator goes on with all of it.
  ~AllRadiosLogGenerator() override;
  static std::unique_ptr<LogGenerator> generator(const Services& services);

  void updateState_withData(Dictionary& state, ByteView data) override;
  Value generateLogUsingState(Dictionary& state) override;
  Value getStartCommand() const override;
  MessageFate fateOf(ByteView message) const override;
  NumberFormats numberFormats() const override;
  std::vector<CodeSections> codeSections() const override;
  std::optional<std::string> missingTemplate() const override;
  bool changesDisplayOf(const Dictionary& state) const override;
  std::optional<Time> writtenAt(const Dictionary& entries, std::string_view key) const override;
  std::optional<Time> refilledAt(const Array& list) const override;

 private:
  /// 0: messages that name none.
  using SubscriptionNumber = std::uint8_t;

  /// Makes the display unless the state has one. False when there is no template, or when the display belongs
  /// to a generator of another kind.
  bool hasDisplayIn(Dictionary& state);
  struct Subscription {
    Subscription(const Services& services, const Value& displayTemplate)
        : groups(services, displayTemplate) {}

    RadioGroups groups;
    Value display{};  // its groups that are shown
    bool isShown = false;
  };

  /// The groups of a subscription, bound to the state's display; null when there are too many.
  Subscription* subscriptionIn(Dictionary& state, SubscriptionNumber number);
  /// Adds a subscription to the display once one of its groups is shown.
  static void showIfAny(Subscription& subscription, SubscriptionNumber number, Dictionary& state);
  /// The template; absent when it cannot be loaded.
  const Value& displayTemplate() const;
  /// Answers what needs no display.
  const RadioGroups& unbound() const;

  bool _isBound = false;                   // the state has a display of this kind
  mutable std::optional<Value> _template;  // loaded when it is needed first
  mutable std::optional<RadioGroups> _unbound;
  std::map<SubscriptionNumber, Subscription> _subscriptions;
};

}  // namespace varnel
