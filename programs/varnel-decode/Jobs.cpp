#include "programs/varnel-decode/Jobs.h"

#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <deque>
#include <memory>
#include <system_error>

#include "programs/varnel-decode/ProgramError.h"

namespace varnel {

namespace {

constexpr int generalError = 1;
// The files of a job while it runs; those that have something in them stay open until its turn comes.
constexpr std::size_t filesOfJob = 3;
constexpr std::size_t mostFiles = 900;
constexpr std::size_t otherFiles = 64;  // of this process
// What jobs that wait for their turn tell may fill this much memory.
constexpr std::size_t mostNotes = std::size_t{128} << 20;
constexpr std::size_t longestDetails = std::size_t{1} << 20;

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;
using Clock = std::chrono::steady_clock;

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
  JobEnd end;
  std::size_t slot = 0;
  File output{}, error{}, details{};
  pid_t process = -1;
  bool hasEnded = false;
  Clock::time_point start{};

  std::size_t files() const {
    return std::size_t{output != nullptr} + (error != nullptr) + (details != nullptr);
  }
  std::size_t notes() const { return sizeof(Job) + end.details.size() + end.lastError.size(); }
};

// How many files the jobs may have open together.
std::size_t fileLimit() {
  rlimit limit{};
  if (::getrlimit(RLIMIT_NOFILE, &limit) != 0) return mostFiles;
  const auto most = static_cast<std::size_t>(limit.rlim_cur);
  return std::min(mostFiles, most - std::min(most, otherFiles));
}

void copy(std::FILE* from, std::FILE* to, const char* toName) {
  std::array<char, 1 << 16> part;
  std::rewind(from);
  while (const std::size_t count = std::fread(part.data(), 1, part.size(), from))
    if (std::fwrite(part.data(), 1, count, to) != count) fail(std::string("cannot write to ") + toName);
  if (std::ferror(from)) fail("cannot read a temporary file");
  if (std::fflush(to) != 0) fail(std::string("cannot write to ") + toName);
}

std::string contentsOf(std::FILE* file) {
  std::string contents;
  std::array<char, 4096> part;
  std::rewind(file);
  while (const std::size_t count = std::fread(part.data(), 1, part.size(), file)) {
    contents.append(part.data(), count);
    if (contents.size() > longestDetails) return {};
  }
  return contents;
}

bool isEmpty(std::FILE* file) {
  struct stat status {};
  return ::fstat(::fileno(file), &status) == 0 && status.st_size == 0;
}

class JobQueue {
 public:
  explicit JobQueue(const JobPlan& plan) : _plan(plan), _names(plan.names), _slots(plan.mostAtATime) {
    if (!isShowingProgress()) return;
    sigset_t childEnds;
    ::sigemptyset(&childEnds);
    ::sigaddset(&childEnds, SIGCHLD);
    ::sigprocmask(SIG_BLOCK, &childEnds, &_signals);
  }
  JobQueue(const JobQueue&) = delete;
  JobQueue& operator=(const JobQueue&) = delete;
  // After a failure the other processes are not needed any more.
  ~JobQueue() {
    for (const Job& job : _jobs) {
      if (job.process < 0 || job.hasEnded) continue;
      ::kill(job.process, SIGTERM);
      while (::waitpid(job.process, nullptr, 0) < 0 && errno == EINTR) {
      }
    }
    if (isShowingProgress()) ::sigprocmask(SIG_SETMASK, &_signals, nullptr);
  }

  int run() {
    try {
      return runAll();
    } catch (...) {
      tellRest();
      throw;
    }
  }

 private:
  int runAll() {
    int worst = 0;
    while (_next < _names.size() || !_jobs.empty()) {
      while (_next < _names.size() && mayStart()) start(_next++);
      if (_running > 0) waitForOne();
      for (; !_jobs.empty() && _jobs.front().hasEnded; _jobs.pop_front()) {
        _files -= _jobs.front().files();
        _notes -= _jobs.front().notes();
        worst = std::max(worst, finish(_jobs.front()));
      }
    }
    return worst;
  }

  // After a failure nothing more is written, but what became of the jobs that have ended is still known.
  void tellRest() noexcept {
    if (!_plan.ended) return;
    try {
      for (const Job& job : _jobs)
        if (job.hasEnded && &job != _finishing) _plan.ended(job.end);
    } catch (const std::exception&) {  // the first failure is the one that is told
    }
  }

  bool mayStart() const {
    if (_jobs.empty()) return true;
    return _running < _plan.mostAtATime && _files + filesOfJob <= _fileLimit && _notes < mostNotes;
  }

  bool isShowingProgress() const { return _plan.progress && _plan.progress->isShown(); }

  void start(std::size_t piece) {
    Job& job = _jobs.emplace_back(Job{.end = {.piece = piece}});
    if (_plan.isLeft && _plan.isLeft(piece)) {
      job.end.wasLeft = job.hasEnded = true;
      _notes += job.notes();
      if (_plan.progress) _plan.progress->leave(piece);
      return;
    }
    job.output = temporaryFile();
    job.error = temporaryFile();
    job.details = temporaryFile();
    _files += job.files();
    job.slot = static_cast<std::size_t>(std::ranges::find(_slots, nullptr) - _slots.begin());
    JobContext context{job.details.get(), nullptr};
    if (_plan.progress) context.bytesRead = _plan.progress->begin(job.slot, piece);
    job.start = Clock::now();
    // Otherwise both processes would write what waits in the buffers.
    std::fflush(nullptr);
    const pid_t parent = ::getpid();
    job.process = ::fork();
    if (job.process < 0) fail("cannot start a process");
    if (job.process == 0) runInChild(job, context, parent);
    _slots[job.slot] = &job;
    ++_running;
  }

  // An exception ends the process here. Further out it would end the other processes too.
  [[noreturn]] void runInChild(const Job& job, JobContext& context, pid_t parent) const noexcept {
    ::prctl(PR_SET_PDEATHSIG, SIGTERM);
    if (::getppid() != parent) ::_exit(generalError);
    if (isShowingProgress()) ::sigprocmask(SIG_SETMASK, &_signals, nullptr);
    ::dup2(::fileno(job.output.get()), STDOUT_FILENO);
    ::dup2(::fileno(job.error.get()), STDERR_FILENO);
    const int status = _plan.work(job.end.piece, context);
    std::fflush(nullptr);
    ::_exit(status);
  }

  void waitForOne() {
    int status = 0;
    pid_t process = -1;
    while ((process = nextEnd(status)) < 0 && errno == EINTR) {
    }
    if (process < 0) fail("cannot wait for a process");
    const auto slot =
        std::ranges::find_if(_slots, [&](const Job* job) { return job && job->process == process; });
    if (slot == _slots.end()) return;
    Job& ended = **slot;
    _files -= ended.files();
    noteEnd(ended, status);
    _files += ended.files();
    _notes += ended.notes();
    *slot = nullptr;
    if (_plan.progress) _plan.progress->end(ended.slot);
    --_running;
  }

  // While a bar is shown, it is drawn again and again until a process ends.
  pid_t nextEnd(int& status) const {
    if (!isShowingProgress()) return ::waitpid(-1, &status, 0);
    sigset_t childEnds;
    ::sigemptyset(&childEnds);
    ::sigaddset(&childEnds, SIGCHLD);
    constexpr timespec pause{.tv_sec = 0, .tv_nsec = 100'000'000};
    pid_t process = 0;
    while ((process = ::waitpid(-1, &status, WNOHANG)) == 0) {
      _plan.progress->look();
      ::sigtimedwait(&childEnds, nullptr, &pause);
    }
    _plan.progress->look();
    return process;
  }

  // Files that the job does not need any more are closed: many jobs may wait for their turn.
  void noteEnd(Job& job, int status) const {
    job.hasEnded = true;
    job.end.time = Clock::now() - job.start;
    job.end.status = WIFEXITED(status) ? WEXITSTATUS(status) : generalError;
    if (WIFSIGNALED(status)) job.end.signal = WTERMSIG(status);
    job.end.lastError = lastLineOf(::fileno(job.error.get()));
    job.end.details = contentsOf(job.details.get());
    job.details.reset();
    if (!_plan.showsOutput || isEmpty(job.output.get())) job.output.reset();
    if (isEmpty(job.error.get())) job.error.reset();
  }

  // Writes the output of the job. Returns its exit status.
  int finish(const Job& job) {
    const JobEnd& end = job.end;
    if (_plan.progress && (job.output || job.error || end.signal)) _plan.progress->erase();
    if (job.output) copy(job.output.get(), stdout, "standard output");
    if (job.error) copy(job.error.get(), stderr, "standard error");
    if (end.signal)
      tell("decoding " + _names[end.piece] + " was ended by a signal: " + ::strsignal(*end.signal));
    _finishing = &job;
    if (_plan.ended) _plan.ended(end);
    _finishing = nullptr;
    return end.status;
  }

  const JobPlan& _plan;
  const std::vector<std::string>& _names;
  std::deque<Job> _jobs;     // jobs that run, and jobs whose output waits, in order
  std::vector<Job*> _slots;  // those that run; null for a free slot
  std::size_t _files = 0;    // open for the jobs
  std::size_t _notes = 0;    // bytes of the jobs that have ended
  const std::size_t _fileLimit = fileLimit();
  std::size_t _next = 0;
  std::size_t _running = 0;
  const Job* _finishing = nullptr;  // the one that is just told
  sigset_t _signals{};              // those that were blocked before, while a bar is shown
};

}  // namespace

int runJobs(const JobPlan& plan) { return JobQueue(plan).run(); }

int runJobs(const std::vector<std::string>& names, unsigned mostAtATime,
            const std::function<int(std::size_t piece)>& work) {
  return runJobs({.names = names,
                  .mostAtATime = mostAtATime,
                  .work = [&](std::size_t piece, JobContext& /*context*/) { return work(piece); }});
}

std::string lastLineOf(int descriptor) {
  struct stat status {};
  if (::fstat(descriptor, &status) != 0) return {};
  std::array<char, 4096> part;
  const auto most = static_cast<off_t>(part.size());
  const off_t offset = std::max<off_t>(status.st_size - most, 0);
  const ssize_t count = ::pread(descriptor, part.data(), part.size(), offset);
  std::string_view text(part.data(), static_cast<std::size_t>(std::max<ssize_t>(count, 0)));
  while (text.ends_with('\n')) text.remove_suffix(1);
  text = text.substr(text.rfind('\n') + 1);
  const std::string prefix = std::string(programName) + ": ";
  if (text.starts_with(prefix)) text.remove_prefix(prefix.size());
  return std::string(text);
}

}  // namespace varnel
