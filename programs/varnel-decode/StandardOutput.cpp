#include "programs/varnel-decode/StandardOutput.h"

#include <cerrno>
#include <system_error>

namespace varnel {

void writeOutput(std::FILE* output, std::string_view text) {
  if (std::fwrite(text.data(), 1, text.size(), output) == text.size() && std::fflush(output) == 0) return;
  throw std::system_error(errno, std::generic_category(), "cannot write to standard output");
}

}  // namespace varnel
