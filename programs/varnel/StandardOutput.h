#pragma once

#include <string>

#include "app/TextViewer.h"

namespace varnel {

/// Pages on standard output: one after the other, or, on a terminal, each in the place of the one before, cut
/// to what the terminal can show.
class StandardOutput final : public TextOutput {
 public:
  StandardOutput();
  ~StandardOutput() override;
  void show(const std::string& page) override;

 private:
  const bool _isTerminal;
};

}  // namespace varnel
