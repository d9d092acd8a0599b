#include "programs/varnel-decode/OutputTree.h"

#include <sys/stat.h>

#include <algorithm>
#include <functional>
#include <system_error>
#include <utility>

namespace varnel {

namespace {

namespace fs = std::filesystem;

using Node = std::pair<dev_t, ino_t>;

std::optional<Node> nodeOf(const fs::path& path) {
  struct stat status {};
  if (::stat(path.c_str(), &status) != 0) return std::nullopt;
  return Node(status.st_dev, status.st_ino);
}

std::string_view displayEnding(DisplayWriter writer) {
  if (writer == displayAsJson) return ".json";
  if (writer == displayAsPropertyList) return ".plist";
  if (writer == displayAsPaths) return ".paths";
  return ".txt";
}

std::string_view eventEnding(EventFormat format) {
  switch (format) {
    case EventFormat::Json:
      return ".jsonl";
    case EventFormat::Csv:
      return ".csv";
    case EventFormat::Text:
      break;
  }
  return ".txt";
}

}  // namespace

std::string_view outputEnding(const Options& options) {
  switch (options.output) {
    case Output::EveryDisplay:
      return ".jsonl";
    case Output::ValueTable:
      return ".csv";
    case Output::Events:
      return eventEnding(options.eventFormat);
    case Output::StatisticsTable:
      return ".txt";
    case Output::StatisticsJson:
      return ".json";
    case Output::Display:
      break;
  }
  return displayEnding(options.writeDisplay);
}

fs::path OutputTree::outputOf(const std::string& capture) const {
  fs::path name = fs::path(capture).lexically_normal();
  if (name.is_relative() && !name.empty() && *name.begin() == "..")
    name = fs::absolute(capture).lexically_normal();
  return _folder / (name.relative_path().string() + _ending);
}

std::optional<std::string> OutputTree::clash(const std::vector<std::string>& captures,
                                             const std::vector<NamedFile>& others) const {
  // There may be very many captures, so their outputs are compared by hashes first.
  std::vector<std::pair<std::size_t, std::size_t>> outputs;  // hash and capture
  std::vector<Node> inputs;
  outputs.reserve(captures.size());
  inputs.reserve(captures.size());
  for (std::size_t i = 0; i < captures.size(); ++i) {
    outputs.emplace_back(std::hash<std::string>()(outputOf(captures[i]).string()), i);
    if (const auto node = nodeOf(captures[i])) inputs.push_back(*node);
  }
  std::ranges::sort(inputs);
  std::ranges::sort(outputs);
  for (std::size_t i = 0; i < outputs.size(); ++i) {
    const auto& [hash, capture] = outputs[i];
    const fs::path output = outputOf(captures[capture]);
    for (std::size_t other = i + 1; other < outputs.size() && outputs[other].first == hash; ++other)
      if (outputOf(captures[outputs[other].second]) == output)
        return captures[capture] + " and " + captures[outputs[other].second] +
               " would have the same output, " + output.string() + "; decode one of them alone";
    const auto node = nodeOf(output);
    if (node && std::ranges::binary_search(inputs, *node))
      return "the output of " + captures[capture] + " would overwrite the capture " + output.string() +
             "; name another folder";
    const auto identity = others.empty() ? FileIdentity() : FileIdentity::ofPath(output);
    for (const NamedFile& file : others)
      if (identity.isSameFileAs(file.identity))
        return "the output of " + captures[capture] + " would overwrite " + file.name +
               "; name another folder";
  }
  return std::nullopt;
}

bool OutputTree::hasNewer(const std::string& capture) const {
  std::error_code failure;
  const auto written = fs::last_write_time(outputOf(capture), failure);
  if (failure) return false;
  const auto captured = fs::last_write_time(capture, failure);
  return !failure && written > captured;
}

}  // namespace varnel
