#include "programs/varnel-decode/OutputClash.h"

#include <unistd.h>

#include <vector>

#include "host/FileIdentity.h"

namespace varnel {

namespace {

struct NamedFile {
  std::string name;
  FileIdentity identity;
};

std::vector<NamedFile> inputsOf(const Options& options) {
  std::vector<NamedFile> inputs;
  for (const std::string& path : options.captures) {
    if (path == "-")
      inputs.push_back({"standard input", FileIdentity::ofDescriptor(STDIN_FILENO)});
    else
      inputs.push_back({path, FileIdentity::ofPath(path)});
  }
  return inputs;
}

bool writesToStandardOutput(const Options& options) {
  return options.output != Output::Display || options.writeDisplay != displayAsNothing;
}

std::vector<NamedFile> outputsOf(const Options& options) {
  std::vector<NamedFile> outputs;
  const auto add = [&](const std::string& option, const std::string& path) {
    outputs.push_back({option + " " + path, FileIdentity::ofPath(path)});
  };
  if (writesToStandardOutput(options))
    outputs.push_back({"standard output", FileIdentity::ofDescriptor(STDOUT_FILENO)});
  if (options.snapshotPath) add("--snapshot", *options.snapshotPath);
  if (options.binaryLogPath) add("--dlf", *options.binaryLogPath);
  if (options.recordsPath) add("--records", *options.recordsPath);
  if (options.pcapPath) add("--pcap", *options.pcapPath);
  if (options.framedPath) add("--framed", *options.framedPath);
  if (options.messagesPath) add("--messages", *options.messagesPath);
  if (options.plot) add("--plot", options.plot->file);
  return outputs;
}

}  // namespace

std::optional<std::string> outputClash(const Options& options) {
  const std::vector<NamedFile> inputs = inputsOf(options);
  std::vector<NamedFile> earlier;
  for (const NamedFile& output : outputsOf(options)) {
    for (const NamedFile& input : inputs) {
      if (output.identity.isSameFileAs(input.identity))
        return output.name + " would overwrite " + input.name + ", which is to be decoded; name another file";
    }
    for (const NamedFile& other : earlier) {
      if (output.identity.isSameFileAs(other.identity))
        return other.name + " and " + output.name + " are one file; name another one";
    }
    earlier.push_back(output);
  }
  return std::nullopt;
}

}  // namespace varnel
