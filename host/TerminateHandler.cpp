#include "host/TerminateHandler.h"

#include <unistd.h>

#include <cstdlib>
#include <exception>

#include "host/HostLog.h"

namespace varnel {

namespace {

// A terminate handler takes no arguments, so the name is kept here.
std::string& nameOfProgram() {
  static std::string name;
  return name;
}

std::string whatEnded() {
  const auto exception = std::current_exception();
  if (!exception) return "no exception";
  try {
    std::rethrow_exception(exception);
  } catch (const std::exception& known) {
    return known.what();
  } catch (...) {
    return "an unknown exception";
  }
}

[[noreturn]] void tellAndAbort() {
  const std::string line = nameOfProgram() + ": ended by " + whatEnded() + "\n";
  [[maybe_unused]] const ssize_t ignored = ::write(STDERR_FILENO, line.data(), line.size());
  if (auto* const log = dynamic_cast<HostLog*>(logSink())) log->giveTime();
  std::abort();
}

}  // namespace

void installTerminateHandler(std::string programName) {
  nameOfProgram() = std::move(programName);
  std::set_terminate(tellAndAbort);
}

}  // namespace varnel
