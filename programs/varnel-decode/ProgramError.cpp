#include "programs/varnel-decode/ProgramError.h"

#include <cstdio>
#include <stdexcept>
#include <system_error>

namespace varnel {

namespace {

void tell(const std::runtime_error& error) { std::fprintf(stderr, "%s: %s\n", programName, error.what()); }

}  // namespace

bool succeeds(const std::function<void()>& part) {
  try {
    part();
    return true;
  } catch (const std::system_error& error) {
    if (error.code() != std::errc::broken_pipe) tell(error);
  } catch (const std::runtime_error& error) {
    tell(error);
  }
  return false;
}

}  // namespace varnel
