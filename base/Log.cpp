#include "base/Log.h"

#include <array>
#include <cinttypes>
#include <cstdio>
#include <string>

namespace varnel {

namespace {

LogSink* currentSink = nullptr;

void append(std::string& line, const char* format, auto number) {
  std::array<char, 352> text;  // the longest double in %lf has 317 characters
  const int length = std::snprintf(text.data(), text.size(), format, number);
  line.append(text.data(), static_cast<std::size_t>(length));
}

}  // namespace

void setLogSink(LogSink* sink, int highestPriority) {
  currentSink = sink;
  setHighestLogPriority(sink ? highestPriority : -1);
}

void setHighestLogPriority(int highestPriority) { logging::highestPriorityTaken = highestPriority; }

LogSink* logSink() { return currentSink; }

void logging::write(int priority, std::string_view format, std::initializer_list<Argument> arguments) {
  std::string line;
  for (const Argument& argument : arguments) {
    const std::size_t percent = format.find('%');
    line.append(format.substr(0, percent));
    const bool isLong = format[percent + 1] == 'l';
    const char conversion = format[percent + (isLong ? 2 : 1)];
    format.remove_prefix(percent + (isLong ? 3 : 2));
    switch (conversion) {
      case 'd':
        append(line, "%" PRId64, isLong ? argument.whole : static_cast<std::int32_t>(argument.whole));
        break;
      case 'u':
        append(line, "%" PRIu32, static_cast<std::uint32_t>(argument.whole));
        break;
      case 'x':
        append(line, "%" PRIx32, static_cast<std::uint32_t>(argument.whole));
        break;
      case 'f':
        append(line, "%f", argument.real);
        break;
      case 'p':
        append(line, "0x%" PRIxPTR, reinterpret_cast<std::uintptr_t>(argument.pointer));
        break;
      default:
        line.append(argument.text);
    }
  }
  line.append(format);
  currentSink->write(priority, line);
}

}  // namespace varnel
