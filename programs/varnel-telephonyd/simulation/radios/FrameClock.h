#pragma once

#include <chrono>

#include "programs/varnel-telephonyd/simulation/Cell.h"

namespace varnel::simulation {

/// The frame and subframe that a cell sends at a moment. A frame lasts 10 ms, and 1024 frames are counted.
/// Each cell has begun at another time.
struct FrameClock {
  FrameClock(const Cell& cell, std::chrono::milliseconds now) {
    const std::int64_t start_ms = cell.identity * 2654435761u % 10'240;
    const std::int64_t time_ms = (now.count() + start_ms) % 10'240;
    frame = time_ms / 10;
    subframe = time_ms % 10;
  }

  std::int64_t frame;
  std::int64_t subframe;
};

}  // namespace varnel::simulation
