#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/Subscription.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// Counts the records of each subscription, and chooses like `SubscriptionFilter`.
class Subscriptions {
 public:
  /// The absent key stands for records that name none; it comes first.
  using Counts = std::map<std::optional<std::uint8_t>, std::uint64_t>;

  explicit Subscriptions(std::optional<std::uint8_t> wanted, Unasked unasked = Unasked::First)
      : _wanted(wanted), _filter(wanted, unasked) {}

  /// Counts the record. Returns whether it is chosen.
  bool take(const CaptureRecord& record);

  const Counts& counts() const { return _counts; }

  /// One sentence for users about the choice: that there are other subscriptions, or that the wanted one does
  /// not occur. Nothing when all records were chosen.
  std::optional<std::string> remark(const std::string& captureName) const;

 private:
  std::vector<std::uint8_t> others() const;

  std::optional<std::uint8_t> _wanted;
  SubscriptionFilter _filter;
  Counts _counts;
};

}  // namespace varnel
