#pragma once

#include <unistd.h>

#include <utility>

namespace varnel {

/// An open file of the process. The destructor closes it.
class FileDescriptor final {
 public:
  /// -1 stands for no file.
  explicit FileDescriptor(int number = -1) : _number(number) {}
  FileDescriptor(FileDescriptor&& other) noexcept : _number(other.release()) {}
  FileDescriptor& operator=(FileDescriptor&& other) noexcept {
    std::swap(_number, other._number);
    return *this;
  }
  ~FileDescriptor() {
    if (isOpen()) ::close(_number);
  }

  bool isOpen() const { return _number >= 0; }
  int number() const { return _number; }
  /// Hands the file to the caller.
  int release() { return std::exchange(_number, -1); }

 private:
  int _number;
};

}  // namespace varnel
