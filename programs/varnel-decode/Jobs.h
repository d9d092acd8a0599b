#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

namespace varnel {

/// Does each of several pieces of work in a process of its own, at most so many at the same time. What they
/// write to standard output and standard error comes out piece by piece in their order, whichever is done
/// first.
///
/// Returned is the worst of their exit statuses. A process that a signal ends has the status 1, and a line on
/// standard error names its piece. Throws std::system_error when a process cannot be started or its output
/// not be passed on.
int runJobs(const std::vector<std::string>& names, unsigned mostAtATime,
            const std::function<int(std::size_t piece)>& work);

}  // namespace varnel
