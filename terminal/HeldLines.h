#pragma once

#include <cstddef>
#include <ostream>
#include <streambuf>
#include <string>
#include <string_view>

namespace varnel {

/// Keeps what would tear the screen while the terminal shows it: lines for standard output, and standard
/// error if it is the same terminal. The lines come out when this object is destroyed, and when the program
/// is ended by a signal. Only the newest lines are kept, and a line tells how many bytes are missing.
class HeldLines final {
 public:
  /// At most this many bytes are kept for long, and of the stream's lines never more than twice as many.
  static constexpr std::size_t most = std::size_t{256} * 1024;

  /// Throws std::system_error when the system lacks resources.
  HeldLines();
  HeldLines(const HeldLines&) = delete;
  HeldLines& operator=(const HeldLines&) = delete;
  ~HeldLines();

  /// The stream for lines that belong to standard output.
  std::ostream& lines() { return _stream; }
  /// What is held at the moment, at most the last 64 KiB.
  std::string last() const;
  /// Drops the oldest lines when there are too many. Call it now and then.
  void trim();

 private:
  class Buffer final : public std::streambuf {
   public:
    explicit Buffer(HeldLines& held) : _held(held) {}

   protected:
    std::streamsize xsputn(const char* text, std::streamsize count) override;
    int overflow(int character) override;

   private:
    HeldLines& _held;
  };

  void add(std::string_view text);
  std::string tail(std::size_t bytes) const;

  int _file;
  int _standardError = -1;  // the terminal, while standard error goes to the file
  std::size_t _dropped = 0;
  Buffer _buffer{*this};
  std::ostream _stream{&_buffer};
};

}  // namespace varnel
