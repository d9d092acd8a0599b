#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <vector>

#include "host/WholeFile.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

namespace fs = std::filesystem;

// True when the file was read. The name is written first, so it is the last line when an input ends the
// process.
bool replay(const fs::path& path) {
  const auto bytes = varnel::readWholeFile(path);
  if (!bytes) {
    std::fprintf(stderr, "cannot read %s\n", path.c_str());
    return false;
  }
  std::printf("%s\n", path.c_str());
  std::fflush(stdout);
  // Exactly as large as the input, so that the sanitizers notice reads past its end.
  const std::vector<std::uint8_t> input(bytes->begin(), bytes->end());
  LLVMFuzzerTestOneInput(input.data(), input.size());
  return true;
}

// The number of files that were replayed; -1 when one could not be read.
int replayAll(const fs::path& folder) {
  int count = 0;
  for (const auto& entry : fs::directory_iterator(folder)) {
    if (!replay(entry.path())) return -1;
    ++count;
  }
  return count;
}

}  // namespace

// Runs a fuzz target on every file of the named folders, without a fuzzer.
int main(int argumentCount, char** arguments) {
  if (argumentCount < 2) {
    std::fprintf(stderr, "usage: %s FOLDER ...\n", arguments[0]);
    return 2;
  }
  try {
    for (int i = 1; i < argumentCount; ++i) {
      if (replayAll(arguments[i]) > 0) continue;
      std::fprintf(stderr, "%s has no inputs\n", arguments[i]);
      return 1;
    }
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
  return 0;
}
