#pragma once

#include <atomic>
#include <concepts>
#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <type_traits>

namespace varnel {

/// Priorities of the system log, numbered as syslog(3) has them.
enum LogPriority : int {
  logErrorPriority = 3,
  logWarningPriority = 4,
  logNoticePriority = 5,
  /// Kept: no priority of syslog(3). The two failures of the binary-log export have it; it is passed on
  /// unchanged.
  logExportFailurePriority = 16,
};

/// Where log lines go.
class LogSink {
 public:
  virtual ~LogSink() = default;
  /// Takes one line. A newline at the end belongs to the text.
  virtual void write(int priority, std::string_view text) = 0;
};

/// Sends lines of this priority number and lower to the sink. Other lines are not even formatted. A null sink
/// takes nothing. The caller keeps the sink alive until another one is set.
void setLogSink(LogSink* sink, int highestPriority);
/// The sink in use; null when there is none.
LogSink* logSink();
/// Changes the highest priority number that the sink gets. May be called from any thread.
void setHighestLogPriority(int highestPriority);

namespace logging {

inline std::atomic<int> highestPriorityTaken{-1};

/// One argument of a log line, of any type.
struct Argument {
  enum class Kind { Signed, Unsigned, Real, Pointer, Text } kind;
  union {
    std::int64_t whole;
    double real;
    const void* pointer;
  };
  std::string_view text{};

  template <std::integral T>
  Argument(T number)
      : kind(std::is_signed_v<T> ? Kind::Signed : Kind::Unsigned), whole(static_cast<std::int64_t>(number)) {}
  Argument(double number) : kind(Kind::Real), real(number) {}
  Argument(const void* address) : kind(Kind::Pointer), pointer(address) {}
  template <std::convertible_to<std::string_view> T>
  Argument(const T& string) : kind(Kind::Text), whole(0), text(string) {}
};

/// A format with one conversion per argument (%d %u %x %ld %lf %p %s). The compiler checks it.
template <class... Arguments>
struct Format {
  template <std::size_t size>
  consteval Format(const char (&literal)[size]) : text(literal, size - 1) {
    std::string_view rest = text;
    (takeConversion<std::remove_cvref_t<Arguments>>(rest), ...);
    if (rest.find('%') != std::string_view::npos) throw "the format has more conversions than arguments";
  }

  std::string_view text;

 private:
  template <class Argument>
  static consteval void takeConversion(std::string_view& rest) {
    const std::size_t percent = rest.find('%');
    if (percent == std::string_view::npos) throw "the format has fewer conversions than arguments";
    rest.remove_prefix(percent + 1);
    std::size_t length = 1;
    bool fits = false;
    if (rest.starts_with("ld")) {
      length = 2;
      fits = std::is_integral_v<Argument>;
    } else if (rest.starts_with("lf")) {
      length = 2;
      fits = std::is_same_v<Argument, double>;
    } else if (rest.starts_with('d') || rest.starts_with('u') || rest.starts_with('x')) {
      fits = std::is_integral_v<Argument> && sizeof(Argument) <= 4;
    } else if (rest.starts_with('p')) {
      fits = std::is_pointer_v<Argument> && !std::is_convertible_v<Argument, std::string_view>;
    } else if (rest.starts_with('s')) {
      fits = std::is_convertible_v<Argument, std::string_view>;
    }
    if (!fits) throw "the conversion does not fit its argument";
    rest.remove_prefix(length);
  }
};

void write(int priority, std::string_view format, std::initializer_list<Argument> arguments);

}  // namespace logging

/// True when the sink takes lines of this priority.
inline bool logTakes(int priority) {
  return priority <= logging::highestPriorityTaken.load(std::memory_order_relaxed);
}

/// Writes a line to the system log. A line that the sink does not take costs one comparison. A null pointer
/// prints as 0x0.
template <class... Arguments>
void logLine(int priority, logging::Format<std::type_identity_t<Arguments>...> format,
             const Arguments&... arguments) {
  if (logTakes(priority)) [[unlikely]]
    logging::write(priority, format.text, {logging::Argument(arguments)...});
}
template <class... Arguments>
void logError(logging::Format<std::type_identity_t<Arguments>...> format, const Arguments&... arguments) {
  logLine<Arguments...>(logErrorPriority, format, arguments...);
}
template <class... Arguments>
void logWarning(logging::Format<std::type_identity_t<Arguments>...> format, const Arguments&... arguments) {
  logLine<Arguments...>(logWarningPriority, format, arguments...);
}

}  // namespace varnel
