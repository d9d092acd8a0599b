#pragma once

#include <vector>

#include "app/SaveControl.h"

namespace varnel {

/// Counts the requests.
class FakeSaveControl final : public SaveControl {
 public:
  bool allowSaveButton() const override { return allows; }
  void showSaveView() override { ++shows; }
  void closeSaveViewLater() override { ++closings; }
  void snapshotWasWritten(const FileWriting& writing) override { writings.push_back(writing); }

  bool allows = false;
  unsigned shows = 0;
  unsigned closings = 0;
  std::vector<FileWriting> writings;
};

}  // namespace varnel
