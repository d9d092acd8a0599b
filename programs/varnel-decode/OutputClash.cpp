#include "programs/varnel-decode/OutputClash.h"

#include <unistd.h>

#include <vector>

#include "programs/varnel-decode/OutputTree.h"

namespace varnel {

namespace {

NamedFile inputNamed(const std::string& path) {
  if (path == "-") return {"standard input", FileIdentity::ofDescriptor(STDIN_FILENO)};
  return {path, FileIdentity::ofPath(path)};
}

bool writesToStandardOutput(const Options& options) {
  if (options.outputFolder || options.writtenList) return false;
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
  if (options.gpxPath) add("--gpx", *options.gpxPath);
  if (options.plot) add("--plot", options.plot->file);
  if (options.databasePath) add("--sqlite", *options.databasePath);
  if (options.writtenList) add("--write-list", *options.writtenList);
  if (options.reportPath) add("--report", *options.reportPath);
  return outputs;
}

}  // namespace

std::optional<std::string> outputClash(const Options& options) {
  std::vector<NamedFile> outputs = outputsOf(options);
  for (std::size_t i = 0; i < outputs.size(); ++i)
    for (std::size_t other = 0; other < i; ++other)
      if (outputs[i].identity.isSameFileAs(outputs[other].identity))
        return outputs[other].name + " and " + outputs[i].name + " are one file; name another one";
  const auto clashWith = [&](const NamedFile& input, const char* use) -> std::optional<std::string> {
    for (const NamedFile& output : outputs)
      if (output.identity.isSameFileAs(input.identity))
        return output.name + " would overwrite " + input.name + ", which is to be " + use +
               "; name another file";
    return std::nullopt;
  };
  if (options.listPath)
    if (auto clash = clashWith(inputNamed(*options.listPath), "read")) return clash;
  // There may be very many captures, so only one of them is looked at at a time.
  for (const std::string& path : options.captures)
    if (auto clash = clashWith(inputNamed(path), "decoded")) return clash;
  if (!options.outputFolder) return std::nullopt;
  if (options.listPath) outputs.push_back(inputNamed(*options.listPath));
  return OutputTree(*options.outputFolder, outputEnding(options)).clash(options.captures, outputs);
}

}  // namespace varnel
