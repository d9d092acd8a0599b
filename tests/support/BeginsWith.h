#pragma once

#include <gmock/gmock.h>

#include <algorithm>
#include <iterator>
#include <vector>

namespace varnel {

MATCHER_P(BeginsWithElements, elements, "begins with " + testing::PrintToString(elements)) {
  const auto count = std::min<std::ptrdiff_t>(std::ssize(arg), std::ssize(elements));
  const std::vector beginning(arg.begin(), arg.begin() + count);
  return testing::ExplainMatchResult(testing::ElementsAreArray(elements), beginning, result_listener);
}

/// Matches a list that has these elements first, in this order, and then any others. For what a new decoder
/// only adds to.
template <class First, class... More>
auto BeginsWith(First first, More... more) {
  return BeginsWithElements(std::vector<First>{first, more...});
}

}  // namespace varnel
