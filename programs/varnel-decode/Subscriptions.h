#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/Subscription.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// Counts the records of each subscription, and chooses those of one as `SubscriptionFilter` does.
class Subscriptions {
 public:
  /// Absent stands for a record that names none; it comes first.
  using Counts = std::map<std::optional<std::uint8_t>, std::uint64_t>;

  explicit Subscriptions(std::optional<std::uint8_t> wanted) : _wanted(wanted), _filter(wanted) {}

  /// Counts the record. Whether it is one of those chosen.
  bool take(const CaptureRecord& record);

  const Counts& counts() const { return _counts; }

  /// What users should know of the choice, a sentence: that there are others, or that there is none of the
  /// wanted one. Nothing when all records were chosen.
  std::optional<std::string> remark(const std::string& captureName) const;

 private:
  std::vector<std::string> others() const;

  const std::optional<std::uint8_t> _wanted;
  SubscriptionFilter _filter;
  Counts _counts;
};

}  // namespace varnel
