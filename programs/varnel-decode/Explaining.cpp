#include "programs/varnel-decode/Explaining.h"

#include <cstdio>
#include <string_view>

#include "base/Dictionary.h"
#include "model/Explanations.h"
#include "programs/varnel-decode/NearestPaths.h"
#include "programs/varnel-decode/ProgramError.h"
#include "programs/varnel-decode/StandardOutput.h"

namespace varnel {

namespace {

constexpr int generalError = 1, usageError = 2;
constexpr std::string_view indent = "  ";

std::string entryText(const std::string& path, const Explanation& explanation) {
  std::string text = path + '\n';
  const std::string lines = explanation.text();
  for (std::size_t begin = 0; begin < lines.size();) {
    const std::size_t end = lines.find('\n', begin) + 1;
    text.append(indent).append(lines, begin, end - begin);
    begin = end;
  }
  return text;
}

// Those that the whole path may mean, or else its last name.
std::vector<std::string> nearestTo(const std::string& path, const Explanations& explanations) {
  const Value keys = Value::ofDictionary();
  for (const std::string& key : explanations.keys()) {
    if (!key.ends_with('*')) keys.dictionary()->set(key, "");
  }
  NearestPaths nearest;
  nearest.take(keys);
  auto found = nearest.to(path);
  return found.empty() ? nearest.to(path.substr(path.rfind('/') + 1)) : found;
}

}  // namespace

int explain(const std::vector<std::string>& paths, const Resources& resources) {
  const Explanations explanations(resources);
  if (explanations.keys().empty()) {
    tell(
        "the resource Explanations.plist cannot be read; install Varnel anew, or let VARNEL_RESOURCES name a "
        "folder that has it");
    return generalError;
  }
  std::string text;
  int status = 0;
  for (const std::string& path : paths) {
    const auto explanation = explanations.of(path);
    if (explanation) {
      if (!text.empty()) text += '\n';
      text += entryText(path, *explanation);
    } else {
      tell("nothing explains '" + path + "'; " +
           adviceOf(nearestTo(path, explanations), "--format paths shows the paths of a capture"));
      status = usageError;
    }
  }
  const bool isWritten = succeeds([&] { writeOutput(stdout, text); });
  return isWritten ? status : generalError;
}

}  // namespace varnel
