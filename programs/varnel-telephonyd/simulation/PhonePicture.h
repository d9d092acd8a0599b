#pragma once

#include <chrono>
#include <deque>
#include <string>

#include "base/Value.h"
#include "programs/varnel-telephonyd/simulation/PhoneActivity.h"
#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// Everything that a picture tells about a GSM phone.
struct PhoneView {
  std::chrono::milliseconds now;
  std::uint64_t number;  ///< the number of the picture
  const Walk& walk;
  const Cell& serving;
  const PhoneActivity& activity;
  std::uint32_t temporaryIdentity, packetTemporaryIdentity;
  std::int64_t sent_bytes, received_bytes;  ///< as packet data
  const std::deque<std::string>& events;    ///< the oldest first
};

/// The whole picture of a phone: dictionaries, arrays, and texts. Every array begins with the name of its
/// elements. A value with its own type is a dictionary with one entry, whose key names the type.
Value phonePicture(const PhoneView& view);

/// A time since the start as hours, minutes, and seconds: 0:01:05.
std::string timeText(std::chrono::milliseconds time);

}  // namespace varnel::simulation
