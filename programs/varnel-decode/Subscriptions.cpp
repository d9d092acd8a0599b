#include "programs/varnel-decode/Subscriptions.h"

namespace varnel {

bool Subscriptions::take(const CaptureRecord& record) {
  ++_counts[record.subscription];
  return _filter.takes(record.subscription);
}

std::vector<std::uint8_t> Subscriptions::others() const {
  std::vector<std::uint8_t> numbers;
  for (const auto& [subscription, count] : _counts)
    if (subscription && subscription != _filter.taken()) numbers.push_back(*subscription);
  return numbers;
}

std::optional<std::string> Subscriptions::remark(const std::string& captureName) const {
  const auto numbers = others();
  if (_wanted && !_counts.contains(_wanted))
    return captureName + " has no records of " + subscriptionName(_wanted) +
           (numbers.empty() ? ", and names no other SIM" : "; it has those of " + subscriptionNames(numbers));
  if (_wanted || _filter.takesAll() || numbers.empty()) return std::nullopt;
  return captureName + " has records of " + subscriptionName(_filter.taken()) +
         ", which are decoded, and of " + subscriptionNames(numbers) + ", which are not; choose by --sim";
}

}  // namespace varnel
