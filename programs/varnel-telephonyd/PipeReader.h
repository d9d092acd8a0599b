#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "programs/varnel-telephonyd/RecordReader.h"

namespace varnel {

/// Reads the capture that comes through an open file, such as a pipe, on a thread of its own. It reads no
/// further than it must for a record that was requested, so the writer waits while nobody wants one.
class PipeReader final : public RecordReader {
 public:
  /// Does not close the descriptor. The name is for errors.
  PipeReader(int descriptor, std::string name);
  PipeReader(const PipeReader&) = delete;
  PipeReader& operator=(const PipeReader&) = delete;
  /// Stops reading.
  ~PipeReader() override;

  /// Whether something can be read without waiting, or the pipe has ended.
  bool isReadable() const;
  /// The technology that the capture names. Waits for the beginning of the capture. Throws CaptureError when
  /// it is no capture. May only be called before `start`.
  std::optional<std::string> technology();
  /// Starts the thread, which calls the function after each request, when there is something to take.
  void start(std::function<void()> arrived);

  void request() override;
  std::optional<RecordReading> take() override;

 private:
  struct Shared;
  const std::unique_ptr<Shared> _shared;
};

}  // namespace varnel
