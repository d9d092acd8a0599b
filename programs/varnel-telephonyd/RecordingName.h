#pragma once

#include <ctime>
#include <string>

namespace varnel {

/// Puts a moment into the name of a recording: the fields of strftime(3), such as %Y-%m-%d or %H%M%S. A name
/// without "%" stays as it is. Returns an empty name when the fields have more than 4096 bytes.
std::string recordingName(const std::string& name, const std::tm& moment);

/// The same for this moment, in the time zone of the host.
std::string recordingNameOfNow(const std::string& name);

}  // namespace varnel
