#include "host/ProgramStart.h"

#include <fcntl.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>

namespace varnel {

namespace {

struct StandardFile {
  int descriptor;
  int flags;
};

// The system gives an opened file the lowest free number.
constexpr StandardFile standardFiles[] = {
    {STDIN_FILENO, O_RDONLY},
    // Opened for reading only: a write must fail, so that lost data does not look written.
    {STDOUT_FILENO, O_RDONLY},
    {STDERR_FILENO, O_WRONLY},
};

bool isOpen(int descriptor) { return ::fcntl(descriptor, F_GETFD) >= 0; }

}  // namespace

void startProgram() {
  for (const auto& [descriptor, flags] : standardFiles) {
    // Without /dev/null there is no way to report anything.
    if (!isOpen(descriptor) && ::open("/dev/null", flags) != descriptor) std::_Exit(EXIT_FAILURE);
  }
  std::signal(SIGXFSZ, SIG_IGN);
}

}  // namespace varnel
