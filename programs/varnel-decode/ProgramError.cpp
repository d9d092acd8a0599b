#include "programs/varnel-decode/ProgramError.h"

#include <cstdio>
#include <stdexcept>

namespace varnel {

bool succeeds(const std::function<void()>& part) {
  try {
    part();
    return true;
  } catch (const std::runtime_error& error) {
    std::fprintf(stderr, "%s: %s\n", programName, error.what());
    return false;
  }
}

}  // namespace varnel
