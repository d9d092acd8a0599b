#include <cerrno>
#include <csignal>
#include <cstdio>
#include <functional>
#include <optional>
#include <ostream>
#include <stdexcept>
#include <string>
#include <system_error>
#include <variant>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "app/Snapshot.h"
#include "platform/PropertyList.h"
#include "platform/TelephonyService.h"
#include "platform/host/BuildInfo.h"
#include "platform/host/Capture.h"
#include "platform/host/FileResources.h"
#include "platform/host/HostLog.h"
#include "platform/host/PrivateFile.h"
#include "platform/host/TerminateHandler.h"
#include "programs/varnel-decode/OfflineDecoder.h"
#include "programs/varnel-decode/Options.h"

namespace varnel {

namespace {

constexpr const char* programName = "varnel-decode";

// Nobody listens to the log yet, so trying the technologies out is silent.
std::vector<std::string> technologiesWithGenerator(const Services& services) {
  std::vector<std::string> names;
  for (const auto name : {technology::ifxGSM, technology::kalviGSMUMTS, technology::kalviCDMA,
                          technology::kalviLTE, technology::kalviUTRAN2}) {
    if (LogGenerator::generatorFromTechnology(name, services)) names.emplace_back(name);
  }
  return names;
}

void readCapture(CaptureReader& capture, OfflineDecoder& decoder) {
  CaptureRecord record;
  while (capture.next(record)) decoder.deliver(record.time, record.message);
}

void writeSnapshotFile(const Value& contents, const std::string& path) {
  const auto list = writeXmlPropertyList(contents);
  if (!list)
    throw std::runtime_error("the snapshot holds what an XML property list cannot, so it was not written");
  if (!writePrivateFile(path, *list))
    throw std::system_error(errno, std::generic_category(), "cannot write " + path);
}

void writeStandardOutput(const std::string& text) {
  if (std::fwrite(text.data(), 1, text.size(), stdout) == text.size() && std::fflush(stdout) == 0) return;
  throw std::system_error(errno, std::generic_category(), "cannot write to standard output");
}

// Does a part of the work. A failure is told on standard error, and whatever comes next is still done.
bool succeeds(const std::function<void()>& part) {
  try {
    part();
    return true;
  } catch (const std::runtime_error& error) {
    std::fprintf(stderr, "%s: %s\n", programName, error.what());
    return false;
  }
}

bool decode(CaptureReader& capture, const Options& options, const Services& services, CaptureClock& clock) {
  const HostLog log({.standardErrorLevel = options.logLevel, .systemLog = HostLog::SystemLog::Unused});
  const auto generator = LogGenerator::generatorFromTechnology(options.technology, services);
  OfflineDecoder decoder(*generator, clock);

  const bool isRead = succeeds([&] { readCapture(capture, decoder); });
  const Value display = decoder.finish();
  const bool isSaved = !options.snapshotPath || succeeds([&] {
    writeSnapshotFile(snapshotContents(clock.now(), decoder.saveContents(), ""), *options.snapshotPath);
  });
  const bool isShown = succeeds([&] { writeStandardOutput(options.writeDisplay(display)); });
  return isRead && isSaved && isShown;
}

int run(int argumentCount, char** arguments) {
  const FileResources resources(resourceFolder());
  const ApplicationInfo application = applicationInfo();
  CaptureClock clock;
  // The lines that generators write to standard output would spoil the data there.
  std::ostream nowhere(nullptr);
  const Services services{resources, clock, application, nowhere};

  const auto choice = readOptions(argumentCount, arguments, technologiesWithGenerator(services));
  if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
  const Options& options = std::get<Options>(choice);

  std::optional<CaptureReader> capture;
  const bool isOpen = succeeds([&] { capture.emplace(options.capturePath); });
  return isOpen && decode(*capture, options, services, clock) ? 0 : 1;
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::installTerminateHandler(varnel::programName);
  // Whoever reads the output may leave early: that is a failed write, not the end by a signal.
  std::signal(SIGPIPE, SIG_IGN);
  return varnel::run(argumentCount, arguments);
}
