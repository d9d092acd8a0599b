#pragma once

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace varnel {

/// A temporary folder, which is removed with this object.
class TemporaryFolder {
 public:
  TemporaryFolder() {
    std::string name = (std::filesystem::temp_directory_path() / "varnel-test-XXXXXX").string();
    if (!::mkdtemp(name.data())) ADD_FAILURE() << "no temporary folder";
    _path = name;
  }
  ~TemporaryFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
  }
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  const std::filesystem::path& path() const { return _path; }
  std::string file(const std::string& name) const { return (_path / name).string(); }

 private:
  std::filesystem::path _path;
};

inline std::string contentsOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(file), {});
}

/// Waits until the condition holds; false when the time is up first. The time must be long, since other work
/// may keep every core busy.
template <class Condition>
bool eventually(Condition condition, std::chrono::milliseconds within = std::chrono::seconds(60)) {
  const auto deadline = std::chrono::steady_clock::now() + within;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > deadline) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
  }
  return true;
}

/// A terminal that the test controls. Its reader learns when it goes away.
class Terminal {
 public:
  Terminal() : _keyboard(::posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC)) {
    if (::grantpt(_keyboard) != 0 || ::unlockpt(_keyboard) != 0) ADD_FAILURE() << "no terminal";
  }
  ~Terminal() { ::close(_keyboard); }
  Terminal(const Terminal&) = delete;
  Terminal& operator=(const Terminal&) = delete;

  void type(std::string_view keys) const {
    EXPECT_EQ(::write(_keyboard, keys.data(), keys.size()), static_cast<ssize_t>(keys.size()));
  }
  /// Whether the terminal shows typed keys and passes them on line by line.
  bool showsLines() const {
    termios mode{};
    ::tcgetattr(_keyboard, &mode);
    return (mode.c_lflag & ECHO) != 0 && (mode.c_lflag & ICANON) != 0;
  }
  std::string name() const { return ::ptsname(_keyboard); }

 private:
  const int _keyboard;
};

/// A real program with its standard output and error in files. The destructor kills it.
class Process {
 public:
  /// `environment` has assignments ("NAME=value") and names to remove ("NAME"), relative to the test's own.
  /// If there is a terminal, it is the program's standard input and controlling terminal, and the program is
  /// in its foreground.
  Process(const std::string& program, std::vector<std::string> arguments,
          std::vector<std::string> environment = {}, const Terminal* terminal = nullptr) {
    arguments.insert(arguments.begin(), program);
    std::vector<char*> pointers;
    pointers.reserve(arguments.size() + 1);
    for (std::string& argument : arguments) pointers.push_back(argument.data());
    pointers.push_back(nullptr);
    const std::string outputPath = _folder.file("output"), errorPath = _folder.file("error");
    const std::string inputPath = terminal ? terminal->name() : "/dev/null";
    _id = ::fork();
    if (_id != 0) return;
    if (terminal) ::setsid();
    const int in = ::open(inputPath.c_str(), O_RDONLY);
    const int out = ::open(outputPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    const int error = ::open(errorPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    ::dup2(in, STDIN_FILENO);
    ::dup2(out, STDOUT_FILENO);
    ::dup2(error, STDERR_FILENO);
    for (std::string& entry : environment) ::putenv(entry.data());
    ::execv(program.c_str(), pointers.data());
    ::_exit(127);
  }
  ~Process() {
    if (_hasEnded) return;
    signal(SIGKILL);
    ::waitpid(_id, &_status, 0);
  }
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;

  void signal(int number) const { ::kill(_id, number); }
  pid_t id() const { return _id; }

  /// True when the program ends by itself within this time.
  bool waitForEnd(std::chrono::milliseconds within = std::chrono::seconds(120)) {
    return eventually(
        [this] { return _hasEnded || (_hasEnded = ::wait4(_id, &_status, WNOHANG, &_usage) == _id); },
        within);
  }
  /// The exit status of a program that has ended by itself, or minus the number of the signal that ended it.
  int exitStatus() const { return WIFEXITED(_status) ? WEXITSTATUS(_status) : -WTERMSIG(_status); }

  /// The highest memory use of a program that has ended, in bytes. It is at least the test's own use when it
  /// started the program.
  std::size_t peakMemory() const { return static_cast<std::size_t>(_usage.ru_maxrss) * 1024; }
  /// The processor time of a program that has ended.
  std::chrono::microseconds processorTime() const {
    const auto sum = [](const timeval& time) {
      return std::chrono::seconds(time.tv_sec) + std::chrono::microseconds(time.tv_usec);
    };
    return sum(_usage.ru_utime) + sum(_usage.ru_stime);
  }

  std::string output() const { return contentsOf(_folder.file("output")); }
  std::string error() const { return contentsOf(_folder.file("error")); }

 private:
  TemporaryFolder _folder;
  pid_t _id = -1;
  int _status = 0;
  rusage _usage{};
  bool _hasEnded = false;
};

}  // namespace varnel
