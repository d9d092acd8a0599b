#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "base/Time.h"

namespace varnel {

/// What can happen to a phone.
enum class EventKind : std::uint8_t {
  CellChange,       ///< there is another serving cell, or the first one
  Handover,         ///< there is another serving cell, and the connection to the network has lasted
  Registration,     ///< the registration has another state
  LossOfService,    ///< the phone searches for a network or a cell, or has limited service
  ReturnOfService,  ///< it has service again
  Connection,       ///< the RRC connection has another state
  UnknownVersion,   ///< a packet of the section has a version that is not known
};

/// The name for users, such as "cell change".
std::string_view nameOf(EventKind kind);

/// Something that has happened to a phone.
struct DisplayEvent {
  Time time;
  EventKind kind;
  /// The path of the section that shows it: "LTE/Serving Cell", with a SIM card "SIM 1/LTE/Serving Cell".
  std::string section;
  /// What the section showed before and what it shows now. `from` is empty when it showed nothing.
  std::string from, to;

  friend bool operator==(const DisplayEvent&, const DisplayEvent&) = default;
};

}  // namespace varnel
