#pragma once

#include <string>

#include "programs/varnel-decode/GenerationWriters.h"
#include "programs/varnel-decode/Options.h"
#include "programs/varnel-decode/PlotRecorder.h"

namespace varnel {

/// Draws the numbers under some paths into a file, after the last generation.
class Picture final : public GenerationSink {
 public:
  explicit Picture(const PlotWish& wish) : _file(wish.file), _recorder(wish.paths) {}
  void take(const Generation& generation) override { _recorder.take(generation); }
  /// Names each path whose values are no numbers: no line shows it.
  void finish(const std::string& inputName) override;

 private:
  const std::string _file;
  PlotRecorder _recorder;
};

}  // namespace varnel
