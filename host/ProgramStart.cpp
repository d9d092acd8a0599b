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

// What is opened gets the lowest number that is free.
constexpr StandardFile standardFiles[] = {
    {STDIN_FILENO, O_RDONLY},
    // Data that is lost must not look as if it were written.
    {STDOUT_FILENO, O_RDONLY},
    {STDERR_FILENO, O_WRONLY},
};

bool isOpen(int descriptor) { return ::fcntl(descriptor, F_GETFD) >= 0; }

}  // namespace

void startProgram() {
  for (const auto& [descriptor, flags] : standardFiles) {
    // Without /dev/null nobody could be told anything either.
    if (!isOpen(descriptor) && ::open("/dev/null", flags) != descriptor) std::_Exit(EXIT_FAILURE);
  }
  std::signal(SIGXFSZ, SIG_IGN);
}

}  // namespace varnel
