#include "programs/varnel-decode/Subscriptions.h"

namespace varnel {

namespace {

std::string joined(const std::vector<std::string>& names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) text += i + 1 < names.size() ? ", " : " and ";
    text += names[i];
  }
  return text;
}

}  // namespace

bool Subscriptions::take(const CaptureRecord& record) {
  ++_counts[record.subscription];
  return _filter.takes(record.subscription);
}

std::vector<std::string> Subscriptions::others() const {
  std::vector<std::string> names;
  for (const auto& [subscription, count] : _counts)
    if (subscription && subscription != _filter.taken()) names.push_back(subscriptionName(subscription));
  return names;
}

std::optional<std::string> Subscriptions::remark(const std::string& captureName) const {
  const auto names = others();
  if (_wanted && !_counts.contains(_wanted))
    return captureName + " has no records of " + subscriptionName(_wanted) +
           (names.empty() ? ", and names no other SIM" : "; it has those of " + joined(names));
  if (_wanted || names.empty()) return std::nullopt;
  return captureName + " has records of " + subscriptionName(_filter.taken()) +
         ", which are decoded, and of " + joined(names) + ", which are not; choose by --sim";
}

}  // namespace varnel
