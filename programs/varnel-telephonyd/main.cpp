#include <csignal>
#include <cstdio>
#include <optional>

#include "host/BuildInfo.h"
#include "host/Capture.h"
#include "host/DescriptorLimit.h"
#include "host/EventLoopQueue.h"
#include "host/HostApplication.h"
#include "host/HostLog.h"
#include "host/RuntimeFolder.h"
#include "host/SignalWatcher.h"
#include "host/SocketPorts.h"
#include "host/SystemClock.h"
#include "host/TelephonyListener.h"
#include "host/TerminateHandler.h"
#include "programs/varnel-telephonyd/Options.h"
#include "programs/varnel-telephonyd/ReplaySource.h"
#include "programs/varnel-telephonyd/SimulationSource.h"
#include "programs/varnel-telephonyd/TelephonyServer.h"

namespace varnel {

namespace {

constexpr const char* programName = "varnel-telephonyd";
constexpr int generalError = 1;
// 64 connections, 16 channels with half a dozen files each, and plenty to spare.
constexpr std::size_t mostFiles = 1024;

// On standard error, since a recording may go to standard output.
void tell(const std::string& sentence) { std::fprintf(stderr, "%s: %s\n", programName, sentence.c_str()); }

int fail(const std::runtime_error& error) {
  std::fprintf(stderr, "%s: %s\n", programName, error.what());
  return generalError;
}

// Writes what is sent to a capture. A failure ends the program.
class Recorder {
 public:
  Recorder(const std::optional<std::string>& path, HostApplication& application) : _application(application) {
    if (path) _writer.emplace(*path);
  }

  void record(ByteView message) {
    if (!_writer) return;
    try {
      _writer->write(_clock.now(), message);
    } catch (const CaptureError& error) {
      _writer.reset();
      _application.end(fail(error));
    }
  }

 private:
  HostApplication& _application;
  const SystemClock _clock;
  std::optional<CaptureWriter> _writer;
};

std::chrono::milliseconds uptime() {
  return std::chrono::duration_cast<std::chrono::milliseconds>(
      std::chrono::steady_clock::now().time_since_epoch());
}

std::unique_ptr<MessageSource> makeSource(const Options& options) {
  if (options.simulatedTechnology) {
    return std::make_unique<SimulationSource>(simulatedModem(*options.simulatedTechnology, options.seed));
  }
  const auto atEnd = options.loops ? ReplaySource::AtEnd::StartOver : ReplaySource::AtEnd::Stop;
  return std::make_unique<ReplaySource>(*options.replayPath, options.speed, atEnd);
}

int serve(int& argumentCount, char** arguments, const Options& options) {
  // A capture that cannot be replayed at all is told now, not when the first viewer comes.
  if (options.replayPath) CaptureReader{*options.replayPath};

  raiseDescriptorLimit(mostFiles);
  HostApplication application(argumentCount, arguments);
  const SignalWatcher signals({SIGINT, SIGTERM}, [&](int /*signal*/) { application.end(0); });
  const HostLog log({.programName = programName, .standardErrorLevel = options.logLevel});
  const std::filesystem::path folder = runtimeFolder(options.runtimeFolder);
  SocketPorts ports(folder);
  EventLoopQueue queue;
  Recorder recorder(options.recordPath, application);
  const std::string technology = options.simulatedTechnology.value_or(options.replayTechnology);
  TelephonyServer server({.ports = ports,
                          .queue = queue,
                          .uptime = uptime,
                          .technology = technology,
                          .makeSource = [&] { return makeSource(options); },
                          .messageSent = [&](ByteView message) { recorder.record(message); },
                          .tell = tell});
  const TelephonyListener listener(
      folder, [&](std::string_view viewerPortName) { return server.createLogChannel(viewerPortName); });
  tell("serving " + technology + " in " + folder.string() + "; now start varnel" +
       (options.runtimeFolder ? " --runtime-dir " + *options.runtimeFolder : ""));
  const int status = application.run();
  server.end();
  tell(inWords(server.counts()));
  return status;
}

int run(int argumentCount, char** arguments) {
  const auto choice = readOptions(argumentCount, arguments, applicationInfo().version.value_or("(none)"));
  if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
  try {
    return serve(argumentCount, arguments, std::get<Options>(choice));
  } catch (const std::runtime_error& error) {
    return fail(error);
  }
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::installTerminateHandler(varnel::programName);
  // Who no longer reads what this program tells does not end its service.
  std::signal(SIGPIPE, SIG_IGN);
  return varnel::run(argumentCount, arguments);
}
