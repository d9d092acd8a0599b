#include "host/DescriptorLimit.h"

#include <sys/resource.h>

#include <algorithm>

namespace varnel {

void raiseDescriptorLimit(std::size_t files) {
  rlimit limit{};
  if (::getrlimit(RLIMIT_NOFILE, &limit) != 0 || limit.rlim_cur >= files) return;
  limit.rlim_cur = std::min<rlim_t>(files, limit.rlim_max);
  // With a lower limit the program only refuses peers sooner: sockets keep a spare descriptor for that.
  static_cast<void>(::setrlimit(RLIMIT_NOFILE, &limit));
}

}  // namespace varnel
