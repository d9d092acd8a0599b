#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "programs/varnel-decode/ListProgress.h"

namespace varnel {

/// What a piece of work has besides its standard output and standard error.
struct JobContext {
  std::FILE* details;                     ///< what is written here comes back as `JobEnd::details`
  std::atomic<std::uint64_t>* bytesRead;  ///< how far it has come; null when nobody looks
};

/// How a piece of work ended.
struct JobEnd {
  std::size_t piece;
  int status = 0;  ///< its exit status; 1 after a signal
  std::optional<int> signal{};
  bool wasLeft = false;     ///< there was nothing to do
  std::string details{};    ///< at most 1 MiB
  std::string lastError{};  ///< the last line on its standard error, without the program's name
  std::chrono::duration<double> time{0};
};

/// Pieces of work, each of which is done in its own process.
struct JobPlan {
  const std::vector<std::string>& names;
  unsigned mostAtATime = 1;
  std::function<int(std::size_t piece, JobContext& context)> work;
  std::function<bool(std::size_t piece)> isLeft{};  ///< whether there is nothing to do; empty for never
  std::function<void(const JobEnd& end)> ended{};   ///< called in the order of the names; may be empty
  bool showsOutput = true;           ///< whether their standard output comes out; otherwise it is dropped
  ListProgress* progress = nullptr;  ///< with a slot for each process; may be null
};

/// Does each piece of work in its own process, at most `mostAtATime` at the same time. Their standard output
/// and standard error come out piece by piece in the order of the names, in whatever order they finish.
///
/// Returns the worst of their exit statuses. A process that a signal ended has the status 1, and a line on
/// standard error names its piece of work. Throws std::system_error when a process cannot be started, or its
/// output cannot be written; `ended` then was called for each piece that had ended by itself.
int runJobs(const JobPlan& plan);

/// The same for pieces of work that tell nothing besides.
int runJobs(const std::vector<std::string>& names, unsigned mostAtATime,
            const std::function<int(std::size_t piece)>& work);

/// The last line of an open file, without the program's name before it. Empty for an empty file. Looks at the
/// last 4 KiB.
std::string lastLineOf(int descriptor);

}  // namespace varnel
