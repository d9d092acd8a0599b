#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/OutputFile.h"
#include "host/captures/CaptureEncoder.h"
#include "programs/varnel-decode/Options.h"

namespace varnel {

/// The files that get the records of a capture as they are, or the messages in them, each in its own form. A
/// file that fails is reported and gets no more records; the others go on.
class RecordOutputs {
 public:
  /// The outputs that the options name.
  explicit RecordOutputs(const Options& options);

  bool areNone() const { return _targets.empty(); }

  /// Opens the files. They appear when `finish` is called.
  void open();
  void write(const CaptureRecord& record);
  /// Completes the files, and reports what of the capture they cannot hold. False when one of
  /// them has failed.
  bool finish(const std::string& captureName);

 private:
  struct Target {
    std::string path;
    std::unique_ptr<CaptureEncoder> encoder;
    std::unique_ptr<OutputFile> file;  // null once it has failed
  };

  void add(const std::optional<std::string>& path, std::unique_ptr<CaptureEncoder> encoder);
  static void write(Target& target, ByteView bytes);
  static void check(Target& target, std::error_code failure);

  std::vector<Target> _targets;
};

}  // namespace varnel
