#pragma once

#include <cstdio>
#include <cstdlib>

namespace varnel {

/// Ends the process with the rule that an input has broken, which makes the input a finding.
inline void require(bool truth, const char* rule) {
  if (truth) return;
  std::fprintf(stderr, "broken rule: %s\n", rule);
  std::abort();
}

}  // namespace varnel
