#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <memory>

#include "host/BuildInfo.h"
#include "host/DescriptorLimit.h"
#include "host/EventLoopQueue.h"
#include "host/HostApplication.h"
#include "host/HostLog.h"
#include "host/Printable.h"
#include "host/ProgramStart.h"
#include "host/RuntimeFolder.h"
#include "host/ServiceManager.h"
#include "host/SignalWatcher.h"
#include "host/SocketPorts.h"
#include "host/SystemClock.h"
#include "host/TelephonyListener.h"
#include "host/TerminateHandler.h"
#include "host/captures/Capture.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/CaptureSurvey.h"
#include "programs/varnel-telephonyd/ControlListener.h"
#include "programs/varnel-telephonyd/ControlProgram.h"
#include "programs/varnel-telephonyd/Options.h"
#include "programs/varnel-telephonyd/PipeReader.h"
#include "programs/varnel-telephonyd/PipedReplay.h"
#include "programs/varnel-telephonyd/Recorder.h"
#include "programs/varnel-telephonyd/ReplaySource.h"
#include "programs/varnel-telephonyd/ServerControls.h"
#include "programs/varnel-telephonyd/SimulationSource.h"
#include "programs/varnel-telephonyd/TelephonyServer.h"
#include "programs/varnel-telephonyd/live/LiveModem.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "programs/varnel-telephonyd/simulation/pty/PseudoTerminal.h"
#include "programs/varnel-telephonyd/simulation/pty/SimulatedPort.h"
#include "programs/varnel-telephonyd/sources/DiagnosticPort.h"
#include "programs/varnel-telephonyd/sources/LivePort.h"
#include "programs/varnel-telephonyd/sources/PortChooser.h"

namespace varnel {

namespace {

constexpr const char* programName = "varnel-telephonyd";
constexpr int generalError = 1;
// Enough for 64 connections and 16 channels with half a dozen files each.
constexpr std::size_t mostFiles = 1024;

// Writes to standard error, since a recording may go to standard output. Names of files must not control the
// terminal.
void tell(const std::string& sentence) {
  std::fprintf(stderr, "%s: %s\n", programName, printable(sentence).c_str());
}

int fail(const std::runtime_error& error) {
  tell(error.what());
  return generalError;
}

// The recorder, if a recording is asked for. Only the process that serves the folder makes it: another server
// there has its own recording.
std::unique_ptr<Recorder> makeRecorder(const Options& options, MainQueue& queue, TelephonyServer& server,
                                       const std::string& technology) {
  if (!options.recordPath) return nullptr;
  if (options.recordPathIsOfNow) tell("the recording is " + *options.recordPath);
  const auto tellEnd = [&queue, &server](const std::string& why) {
    tell(why);
    // Deferred: a channel is sending now.
    queue.after(std::chrono::milliseconds(0), [&server, why] { server.note(why); });
  };
  return std::make_unique<Recorder>(Recorder::Setup{.path = *options.recordPath,
                                                    .existing = options.existingRecording,
                                                    .technology = technology,
                                                    .now = [] { return SystemClock().now(); },
                                                    .uptime = timeSinceBoot,
                                                    .ended = tellEnd});
}

std::chrono::milliseconds uptime() {
  return std::chrono::duration_cast<std::chrono::milliseconds>(
      std::chrono::steady_clock::now().time_since_epoch());
}

std::unique_ptr<MessageSource> makeSource(const Options& options, Unasked unasked) {
  if (options.simulatedTechnology) {
    return std::make_unique<SimulationSource>(
        [technology = *options.simulatedTechnology, seed = options.seed] {
          return simulatedModem(technology, seed);
        });
  }
  const auto atEnd = options.loops ? ReplaySource::AtEnd::StartOver : ReplaySource::AtEnd::Stop;
  return std::make_unique<ReplaySource>(*options.replayPath, options.speed, atEnd, options.subscription,
                                        unasked);
}

// The reader of standard input, if that is what is replayed.
std::unique_ptr<PipeReader> makePipeReader(const Options& options) {
  if (options.replayPath != "-") return nullptr;
  return std::make_unique<PipeReader>(STDIN_FILENO, captureName("-"));
}

// The technology that the capture names. Throws CaptureError.
std::optional<std::string> technologyOfCapture(const Options& options, PipeReader* pipe) {
  if (!pipe) return openCapture(*options.replayPath)->technology();
  // A live pipe may begin much later, so its beginning is read only where it is needed.
  if (options.replayTechnology) return std::nullopt;
  if (!pipe->isReadable())
    tell(
        "waiting for the beginning of standard input, which may name the technology; --technology names it "
        "at once");
  return pipe->technology();
}

// The technology that viewers are told. Opens the capture, if there is one, to ask it. Throws CaptureError.
std::string technologyOf(const Options& options, PipeReader* pipe) {
  if (options.portPath || options.isLive || namesNoSource(options)) return std::string(technology::allRadios);
  if (options.simulatedTechnology) return *options.simulatedTechnology;
  const auto named = technologyOfCapture(options, pipe);
  if (options.replayTechnology) return *options.replayTechnology;
  const auto known = simulatedTechnologies();
  const bool isKnown = named && std::ranges::find(known, *named) != std::ranges::end(known);
  return isKnown ? *named : std::string(technology::allRadios);
}

// The replay of the pipe, which the reader wakes through the queue; none without a reader.
std::unique_ptr<PipedReplay> makePipedReplay(const Options& options, MainQueue& queue,
                                             std::unique_ptr<PipeReader> reader, Unasked unasked) {
  if (!reader) return nullptr;
  PipeReader& pipe = *reader;
  auto replay = std::make_unique<PipedReplay>(PipedReplay::Setup{.reader = std::move(reader),
                                                                 .queue = queue,
                                                                 .uptime = uptime,
                                                                 .name = captureName("-"),
                                                                 .speed = options.speed,
                                                                 .subscription = options.subscription,
                                                                 .unasked = unasked});
  pipe.start([&queue, &replay = *replay] { queue.async([&replay] { replay.recordArrived(); }); });
  return replay;
}

// Looks for a port, or keeps ModemManager away from one, if that is asked for.
std::unique_ptr<PortChooser> makePortChooser(const Options& options, MainQueue& queue) {
  if (options.portPath != automaticPort && !options.inhibitsModemManager) return nullptr;
  using Use = PortChooser::ModemManagers;
  return std::make_unique<PortChooser>(PortChooser::Setup{
      .queue = queue, .use = options.inhibitsModemManager ? Use::IsInhibited : Use::Stays, .tell = tell});
}

// Looks for a port that is free. Absent when the program was asked to end meanwhile; empty when there is
// none.
std::optional<std::string> searchPort(PortChooser& chooser, MainQueue& queue, HostApplication& application) {
  std::optional<std::string> chosen;
  queue.async([&] {
    chooser.search([&](const std::optional<std::string>& path) {
      chosen = path.value_or("");
      application.end(0);
    });
  });
  application.run();
  return chosen;
}

// Takes what is there, without any option that names a source: a diagnostic port, else ModemManager. Tells
// which and why. Returns false when the program was asked to end meanwhile.
bool chooseSource(Options& options, MainQueue& queue, HostApplication& application) {
  std::string reason;
  PortChooser chooser({.queue = queue, .tell = [&reason](const std::string& sentence) {
                         // The first clause of the first sentence. What follows is about another command.
                         if (reason.empty()) reason = sentence.substr(0, sentence.find(';'));
                       }});
  const auto port = searchPort(chooser, queue, application);
  if (!port) return false;
  if (port->empty()) {
    options.isLive = true;
    tell("no diagnostic port can be used (" + reason + "), so the server shows what ModemManager tells");
  } else {
    options.portPath = *port;
    tell("no option names a source, and " + *port +
         " is a diagnostic port, so the server shows what it sends");
  }
  return true;
}

// The device's path, for which the event loop may have to run. Else the exit status: 0 when the program was
// asked to end meanwhile. Throws std::runtime_error.
std::variant<std::string, ExitStatus> choosePort(const Options& options, PortChooser* chooser,
                                                 MainQueue& queue, HostApplication& application) {
  if (options.portPath != automaticPort) {
    if (chooser) chooser->inhibitModemOf(*options.portPath);
    return *options.portPath;
  }
  const auto chosen = searchPort(*chooser, queue, application);
  if (!chosen) return ExitStatus{0};
  if (chosen->empty()) return ExitStatus{generalError};
  return *chosen;
}

// The port of a modem. Its device is not open yet.
std::unique_ptr<LivePort> makeLivePort(const std::string& path, MainQueue& queue,
                                       HostApplication& application,
                                       const std::function<void()>& tellServing) {
  const auto tellModem = [path, tellServing](const std::string& build) {
    tell(path + " is the diagnostic port of a modem" + (build.empty() ? "" : ", build " + build));
    tellServing();
  };
  const auto giveUp = [&application](const std::string& why) {
    tell(why);
    application.end(generalError);
  };
  return std::make_unique<LivePort>(LivePort::Setup{.device = std::make_unique<DiagnosticPort>(path),
                                                    .queue = queue,
                                                    .uptime = uptime,
                                                    .name = path,
                                                    .tell = tell,
                                                    .ready = tellModem,
                                                    .failed = giveUp});
}

// Ends the program. A modem is made quiet first, unless the user asks twice.
template <class Modem>
void end(HostApplication& application, Modem& modem) {
  if (modem.isEnding()) return application.end(0);
  modem.end([&application] { application.end(0); });
}

void end(HostApplication& application, LivePort* port, LiveModem* modem) {
  if (port) return end(application, *port);
  if (modem) return end(application, *modem);
  application.end(0);
}

ServedSource servedSource(const Options& options) {
  if (options.portPath) return ServedSource::Port;
  if (options.isLive) return ServedSource::ModemManager;
  if (options.simulatedTechnology) return ServedSource::Simulation;
  return options.replayPath == "-" ? ServedSource::StandardInput : ServedSource::Capture;
}

// What is read ahead of a capture, if one is replayed, to know how long it plays.
std::unique_ptr<CaptureSurvey> makeSurvey(const Options& options, MainQueue& queue, Unasked unasked) {
  if (servedSource(options) != ServedSource::Capture) return nullptr;
  return std::make_unique<CaptureSurvey>(queue, *options.replayPath, options.subscription, unasked);
}

// What ModemManager tells of a modem, if that is asked for.
std::unique_ptr<LiveModem> makeLiveModem(const Options& options, MainQueue& queue) {
  if (!options.isLive) return nullptr;
  return std::make_unique<LiveModem>(LiveModem::Setup{.queue = queue,
                                                      .uptime = uptime,
                                                      .wanted = options.modem,
                                                      .pollInterval = std::chrono::seconds(options.poll_s),
                                                      .tellsPosition = options.recordsPosition,
                                                      .tell = tell});
}

int serve(int& argumentCount, char** arguments, Options options) {
  // A capture that cannot be replayed is reported now, not when the first viewer comes.
  std::unique_ptr<PipeReader> reader = makePipeReader(options);
  const std::string technology = technologyOf(options, reader.get());
  Unasked unasked = unaskedOf(technology);
  Options served = options;  // with the technology of now

  raiseDescriptorLimit(mostFiles);
  HostApplication application(argumentCount, arguments);
  std::unique_ptr<LivePort> livePort;
  std::unique_ptr<LiveModem> liveModem;
  const SignalWatcher signals({SIGINT, SIGTERM, SIGHUP},
                              [&](int /*signal*/) { end(application, livePort.get(), liveModem.get()); });
  const HostLog log({.programName = programName, .standardErrorLevel = options.logLevel});
  const RuntimeFolder folder = serversFolder(options.runtimeFolder, options.allowedGroup);
  SocketPorts ports(folder);
  EventLoopQueue queue;
  const std::unique_ptr<PipedReplay> pipedReplay =
      makePipedReplay(options, queue, std::move(reader), unasked);
  const auto tellServing = [&] {
    tell("serving " + technology + " in " + folder.path.string() + "; now start varnel" +
         (options.runtimeFolder ? " --runtime-dir " + *options.runtimeFolder : ""));
    tellServiceManager("READY=1");
  };
  if (namesNoSource(options) && !chooseSource(options, queue, application)) return 0;
  liveModem = makeLiveModem(options, queue);
  const std::unique_ptr<PortChooser> chooser = makePortChooser(options, queue);
  if (options.portPath) {
    const auto choice = choosePort(options, chooser.get(), queue, application);
    if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
    livePort = makeLivePort(std::get<std::string>(choice), queue, application, tellServing);
  }
  const auto makeAnySource = [&] {
    if (livePort) return livePort->makeSource();
    if (liveModem) return liveModem->makeSource();
    return pipedReplay ? pipedReplay->makeSource() : makeSource(served, unasked);
  };
  std::unique_ptr<Recorder> recorder;
  TelephonyServer server({.ports = ports,
                          .queue = queue,
                          .uptime = uptime,
                          .technology = technology,
                          .makeSource = makeAnySource,
                          .messageSent =
                              [&](ByteView message) {
                                if (recorder) recorder->record(message);
                              },
                          .tell = tell,
                          .fault = options.fault});
  const TelephonyListener listener(
      folder, [&](std::string_view viewerPortName) { return server.createLogChannel(viewerPortName); });
  std::unique_ptr<CaptureSurvey> survey = makeSurvey(options, queue, unasked);
  ServerControls controls(
      {.server = server,
       .source = servedSource(options),
       .name = livePort ? livePort->name() : options.replayPath.value_or(""),
       .speed = options.speed,
       .recording = options.recordPath,
       .clients = [&] { return listener.clients(server.viewerPorts()); },
       .modem = liveModem ? [&] { return liveModem->state(); } : std::function<std::string()>(),
       .leftOutOfPort = livePort ? [&] { return livePort->leftOut(); } : std::function<LeftOut()>(),
       .survey = [&] { return survey ? survey->result() : std::nullopt; },
       .useTechnology =
           [&](const std::string& chosen) {
             if (served.simulatedTechnology) served.simulatedTechnology = chosen;
             unasked = unaskedOf(chosen);
             survey = makeSurvey(options, queue, unasked);
             tell("serving " + chosen + " from now on");
           },
       // Later: the reply comes first.
       .stop =
           [&] {
             queue.after(std::chrono::milliseconds(0),
                         [&] { end(application, livePort.get(), liveModem.get()); });
           }});
  const ControlListener controlListener(
      folder.path, [&](const ControlRequest& request) { return controls.reply(request); });
  recorder = makeRecorder(options, queue, server, technology);
  if (livePort) {
    livePort->open();
  } else {
    tellServing();
  }
  if (liveModem) liveModem->start();
  const int status = application.run();
  tellServiceManager("STOPPING=1");
  server.end();
  if (status != 0) return status;
  tell(inWords(server.counts()));
  if (livePort) tell(inWords(livePort->records(), livePort->leftOut()));
  if (liveModem) tell("ModemManager: " + std::to_string(liveModem->sent()) + " packets made");
  return status;
}

// Plays the diagnostic port of a simulated modem for servers of other processes.
int playPort(int& argumentCount, char** arguments, const Options& options) {
  HostApplication application(argumentCount, arguments);
  const SignalWatcher signals({SIGINT, SIGTERM, SIGHUP}, [&](int /*signal*/) { application.end(0); });
  EventLoopQueue queue;
  std::unique_ptr<SimulatedPort> port;
  PseudoTerminal terminal([&](ByteView bytes) { port->take(bytes); });
  port = std::make_unique<SimulatedPort>(
      SimulatedPort::Setup{.modem = simulatedModem(*options.simulatedTechnology, options.seed),
                           .queue = queue,
                           .uptime = uptime,
                           .now = [] { return SystemClock().now(); },
                           .send = [&](ByteView frame) { return terminal.send(frame); },
                           .build = "simulated " + *options.simulatedTechnology});
  // Scripts read the name; it stands alone on standard output.
  std::printf("%s\n", terminal.name().c_str());
  std::fflush(stdout);
  tell("playing a modem's diagnostic port; now start " + std::string(programName) + " --port " +
       terminal.name());
  const int status = application.run();
  tell("port: " + std::to_string(port->sent()) + " records sent, " + std::to_string(port->dropped()) +
       " not taken");
  return status;
}

int run(int argumentCount, char** arguments) {
  const std::string version = applicationInfo().version.value_or("(none)");
  if (isControlCommand(argumentCount, arguments)) return runControlCommand(argumentCount, arguments, version);
  const auto choice = readOptions(argumentCount, arguments, version);
  if (const auto* status = std::get_if<ExitStatus>(&choice)) return status->code;
  try {
    const auto& options = std::get<Options>(choice);
    return options.playsPort ? playPort(argumentCount, arguments, options)
                             : serve(argumentCount, arguments, options);
  } catch (const std::runtime_error& error) {
    return fail(error);
  }
}

}  // namespace

}  // namespace varnel

int main(int argumentCount, char** arguments) {
  varnel::startProgram();
  varnel::installTerminateHandler(varnel::programName);
  // The server goes on when nobody reads its standard error any more.
  std::signal(SIGPIPE, SIG_IGN);
  return varnel::run(argumentCount, arguments);
}
