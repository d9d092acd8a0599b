#pragma once

#include <QByteArray>
#include <QProcess>
#include <functional>
#include <optional>
#include <string>

#include "app/EventHistory.h"
#include "app/ValueHistory.h"
#include "programs/shared/NumberStream.h"
#include "programs/varnel/HistoryTrends.h"

namespace varnel {

/// The numbers and events of a whole capture. Another process decodes it in the background
/// (`varnel-numbers`), while the viewer plays it at its own pace. The process is ended when this object goes.
class CaptureHistory final {
 public:
  struct Wish {
    std::string path;
    std::string technology{};                           ///< empty: what the capture names
    std::optional<unsigned> subscription{};             ///< absent: as in the viewer
    std::function<std::optional<Time>()> playedTime{};  ///< of the capture; may be empty
    std::string program{};  ///< that decodes; empty for the one that comes with the viewer
  };

  /// Samples do not go for their age. `ValueHistory::mostGenerations` are 36 hours, since a display is made
  /// every two seconds. Rows that are very many fill the memory sooner.
  static constexpr ValueHistory::Limits limits{.length = std::chrono::hours(24 * 365),
                                               .bytes = std::size_t{64} << 20};

  explicit CaptureHistory(Wish wish);
  CaptureHistory(const CaptureHistory&) = delete;
  CaptureHistory& operator=(const CaptureHistory&) = delete;
  ~CaptureHistory();

  const ValueHistory& numbers() const { return _numbers; }
  const EventHistory& events() const { return _events; }
  HistoryTrends& trends() { return _trends; }

  bool isReading() const { return _state == State::Reading; }
  /// Whether no display was found so far.
  bool isEmpty() const { return _isEmpty; }
  /// How much is read, 0 to 1; absent when nothing is being read.
  std::optional<double> progress() const;
  /// What the history lacks, in sentences for users; empty when it has everything.
  std::string remark() const;

 private:
  enum class State { Reading, Done };

  void takeBytes();
  void takeErrors();
  void takeGeneration(Time time, std::span<const ValueHistory::Reading> readings);
  void takeEvent(DisplayEvent event);
  void processHasEnded();
  void end(std::string why);

  const Wish _wish;
  ValueHistory _numbers{{}, limits};
  EventHistory _events;
  HistoryTrends _trends;
  NumberStreamReader _reader;
  State _state = State::Reading;
  bool _isDated = true;
  bool _isEmpty = true;
  double _progress = 0;
  QByteArray _errors;  // the last ones that the process has written
  std::string _why;    // the capture was not read to its end; empty when it was
  QProcess _process;   // last: its signals use the others
};

}  // namespace varnel
