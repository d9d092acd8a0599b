#include "programs/varnel-telephonyd/RecordingName.h"

namespace varnel {

std::string recordingName(const std::string& name, const std::tm& moment) {
  constexpr std::size_t longest = 4096;
  if (name.find('%') == std::string::npos) return name;
  // One more byte tells an empty result, which is possible, from one that has no room.
  std::string result(longest + 2, '\0');
  const std::size_t length = std::strftime(result.data(), result.size(), (name + '.').c_str(), &moment);
  result.resize(length > 0 ? length - 1 : 0);
  return result;
}

std::string recordingNameOfNow(const std::string& name) {
  const std::time_t now = std::time(nullptr);
  std::tm moment{};
  ::localtime_r(&now, &moment);
  return recordingName(name, moment);
}

}  // namespace varnel
