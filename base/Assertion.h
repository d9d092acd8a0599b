#pragma once

#include <stdexcept>
#include <string>
#include <utility>

namespace varnel {

/// Something that the program relies on is not true. No code catches it: the program ends, and its last
/// message names file, line, and description.
class AssertionFailure : public std::logic_error {
 public:
  AssertionFailure(std::string file, int line, std::string description)
      : std::logic_error("assertion failure in " + file + ":" + std::to_string(line) + ": " + description),
        _file(std::move(file)),
        _line(line),
        _description(std::move(description)) {}

  const std::string& file() const { return _file; }
  int line() const { return _line; }
  const std::string& description() const { return _description; }

 private:
  std::string _file;
  int _line;
  std::string _description;
};

}  // namespace varnel
