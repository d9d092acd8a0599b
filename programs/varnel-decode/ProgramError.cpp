#include "programs/varnel-decode/ProgramError.h"

#include <cstdio>
#include <stdexcept>
#include <system_error>

#include "host/Printable.h"

namespace varnel {

void tell(std::string_view text) { std::fprintf(stderr, "%s: %s\n", programName, printable(text).c_str()); }

bool succeeds(const std::function<void()>& part) {
  try {
    part();
    return true;
  } catch (const std::system_error& error) {
    if (error.code() != std::errc::broken_pipe) tell(error.what());
  } catch (const std::runtime_error& error) {
    tell(error.what());
  }
  return false;
}

}  // namespace varnel
