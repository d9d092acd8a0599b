#pragma once

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <csignal>

namespace varnel {

/// While this object lives, no file of this process grows beyond the limit, as if the disk were full.
class FileSizeLimit {
 public:
  explicit FileSizeLimit(rlim_t bytes) : _handler(std::signal(SIGXFSZ, SIG_IGN)) {
    if (::getrlimit(RLIMIT_FSIZE, &_before) != 0) ADD_FAILURE() << "no limits";
    const rlimit limit{bytes, _before.rlim_max};
    if (::setrlimit(RLIMIT_FSIZE, &limit) != 0) ADD_FAILURE() << "no limit of the size of files";
  }
  ~FileSizeLimit() {
    ::setrlimit(RLIMIT_FSIZE, &_before);
    std::signal(SIGXFSZ, _handler);
  }
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;

 private:
  void (*_handler)(int);
  rlimit _before{};
};

}  // namespace varnel
