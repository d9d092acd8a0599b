#include "programs/varnel-decode/Jobs.h"

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <deque>
#include <memory>
#include <optional>
#include <system_error>

#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

namespace {

constexpr int generalError = 1;
// Outputs that wait for their turn are open files.
constexpr std::size_t mostWaiting = 300;

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

[[noreturn]] void fail(const std::string& what) {
  throw std::system_error(errno, std::generic_category(), what);
}

// A file that no other process sees and that disappears when it is closed. So outputs of any length take no
// memory.
File temporaryFile() {
  File file(std::tmpfile());
  if (!file) fail("cannot make a temporary file");
  return file;
}

struct Job {
  std::size_t piece;
  File output = temporaryFile();
  File error = temporaryFile();
  pid_t process = -1;
  std::optional<int> waitStatus{};  // absent while the process runs
};

void copy(std::FILE* from, std::FILE* to, const char* toName) {
  std::array<char, 1 << 16> part;
  std::rewind(from);
  while (const std::size_t count = std::fread(part.data(), 1, part.size(), from))
    if (std::fwrite(part.data(), 1, count, to) != count) fail(std::string("cannot write to ") + toName);
  if (std::ferror(from)) fail("cannot read a temporary file");
  if (std::fflush(to) != 0) fail(std::string("cannot write to ") + toName);
}

class JobQueue {
 public:
  JobQueue(const std::vector<std::string>& names, unsigned mostAtATime,
           const std::function<int(std::size_t)>& work)
      : _names(names), _mostAtATime(mostAtATime), _work(work) {}
  JobQueue(const JobQueue&) = delete;
  JobQueue& operator=(const JobQueue&) = delete;
  // After a failure the other processes are not needed any more.
  ~JobQueue() {
    for (const Job& job : _jobs) {
      if (job.process < 0 || job.waitStatus) continue;
      ::kill(job.process, SIGTERM);
      while (::waitpid(job.process, nullptr, 0) < 0 && errno == EINTR) {
      }
    }
  }

  int run() {
    int worst = 0;
    while (_next < _names.size() || !_jobs.empty()) {
      while (_next < _names.size() && _running < _mostAtATime && _jobs.size() < mostWaiting) start(_next++);
      waitForOne();
      for (; !_jobs.empty() && _jobs.front().waitStatus; _jobs.pop_front())
        worst = std::max(worst, finish(_jobs.front()));
    }
    return worst;
  }

 private:
  void start(std::size_t piece) {
    _jobs.push_back(Job{.piece = piece});
    Job& job = _jobs.back();
    // Otherwise both processes would write what waits in the buffers.
    std::fflush(nullptr);
    const pid_t parent = ::getpid();
    job.process = ::fork();
    if (job.process < 0) fail("cannot start a process");
    if (job.process == 0) runInChild(job, parent);
    ++_running;
  }

  [[noreturn]] void runInChild(const Job& job, pid_t parent) const {
    ::prctl(PR_SET_PDEATHSIG, SIGTERM);
    if (::getppid() != parent) ::_exit(generalError);
    ::dup2(::fileno(job.output.get()), STDOUT_FILENO);
    ::dup2(::fileno(job.error.get()), STDERR_FILENO);
    const int status = _work(job.piece);
    std::fflush(nullptr);
    ::_exit(status);
  }

  void waitForOne() {
    int status = 0;
    pid_t process = -1;
    while ((process = ::waitpid(-1, &status, 0)) < 0 && errno == EINTR) {
    }
    if (process < 0) fail("cannot wait for a process");
    const auto ended = std::ranges::find(_jobs, process, &Job::process);
    if (ended == _jobs.end()) return;
    ended->waitStatus = status;
    --_running;
  }

  // Writes the output of the job. Returns its exit status.
  int finish(const Job& job) const {
    copy(job.output.get(), stdout, "standard output");
    copy(job.error.get(), stderr, "standard error");
    if (WIFEXITED(*job.waitStatus)) return WEXITSTATUS(*job.waitStatus);
    tell("decoding " + _names[job.piece] +
         " was ended by a signal: " + ::strsignal(WTERMSIG(*job.waitStatus)));
    return generalError;
  }

  const std::vector<std::string>& _names;
  const std::size_t _mostAtATime;
  const std::function<int(std::size_t)>& _work;
  std::deque<Job> _jobs;  // jobs that run, and jobs whose output waits, in order
  std::size_t _next = 0;
  std::size_t _running = 0;
};

}  // namespace

int runJobs(const std::vector<std::string>& names, unsigned mostAtATime,
            const std::function<int(std::size_t piece)>& work) {
  return JobQueue(names, mostAtATime, work).run();
}

}  // namespace varnel
