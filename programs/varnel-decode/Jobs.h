#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

namespace varnel {

/// Does each of several pieces of work in its own process, at most `mostAtATime` at the same time. Their
/// standard output and standard error come out piece by piece in the order of the names, in whatever order
/// they finish.
///
/// Returns the worst of their exit statuses. A process that a signal ended has the status 1, and a line on
/// standard error names its piece of work. Throws std::system_error when a process cannot be started, or its
/// output cannot be written.
int runJobs(const std::vector<std::string>& names, unsigned mostAtATime,
            const std::function<int(std::size_t piece)>& work);

}  // namespace varnel
