#pragma once

#include <limits>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Log.h"

namespace varnel {

/// Takes every line of the system log while it lives.
class RecordingLog final : public LogSink {
 public:
  struct Line {
    int priority;
    std::string text;
  };

  RecordingLog() { setLogSink(this, std::numeric_limits<int>::max()); }
  RecordingLog(const RecordingLog&) = delete;
  RecordingLog& operator=(const RecordingLog&) = delete;
  ~RecordingLog() override { setLogSink(_previous, _previousPriority); }

  void write(int priority, std::string_view text) override {
    _lines.push_back({priority, std::string(text)});
  }

  const std::vector<Line>& lines() const { return _lines; }

  /// The lines since the last call.
  std::vector<Line> take() { return std::exchange(_lines, {}); }

  /// The lines since the last call, each as "<priority>text".
  std::vector<std::string> takeTexts() {
    std::vector<std::string> texts;
    for (const Line& line : take()) texts.push_back("<" + std::to_string(line.priority) + ">" + line.text);
    return texts;
  }

 private:
  LogSink* _previous = logSink();
  int _previousPriority = logging::highestPriorityTaken;
  std::vector<Line> _lines;
};

}  // namespace varnel
