#pragma once

#include "app/SaveControl.h"

namespace varnel {

/// Counts what it is asked for.
class FakeSaveControl final : public SaveControl {
 public:
  bool allowSaveButton() const override { return allows; }
  void showSaveView() override { ++shows; }
  void closeSaveViewLater() override { ++closings; }

  bool allows = false;
  unsigned shows = 0;
  unsigned closings = 0;
};

}  // namespace varnel
