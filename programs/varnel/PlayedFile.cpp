#include "programs/varnel/PlayedFile.h"

#include <QCoreApplication>
#include <chrono>
#include <filesystem>
#include <stdexcept>

#include "host/Printable.h"
#include "host/captures/Capture.h"

namespace varnel {

namespace {

constexpr std::chrono::milliseconds intervalOfPlaying(500);

}  // namespace

std::vector<std::string> argumentsForReplay(const Options& options, const std::string& capture,
                                            const std::optional<std::string>& technology) {
  // A name may begin like an option.
  std::vector<std::string> arguments{"--replay=" + capture};
  if (technology) arguments.push_back("--technology=" + *technology);
  if (options.subscription) arguments.push_back("--sim=" + std::to_string(*options.subscription));
  return arguments;
}

std::optional<Time> firstTimeOf(const std::string& capture) {
  std::error_code failure;
  if (!std::filesystem::is_regular_file(capture, failure)) return std::nullopt;
  try {
    CaptureRecord record;
    if (openCapture(capture)->next(record)) return record.time;
  } catch (const CaptureError&) {  // its server tells
  }
  return std::nullopt;
}

PlayedFile::PlayedFile(const Options& options, HostServices& services) : _services(services) {
  if (!options.file) return;
  if (auto displays = savedDisplays(*options.file)) {
    _displays = *std::move(displays);
  } else {
    play(options);
  }
}

void PlayedFile::play(const Options& options) {
  _server = std::make_unique<ChildServer>(
      serverProgram(), argumentsForReplay(options, *options.file, options.technology),
      ChildServer::Handlers{
          .ready = [this] { _start.quit(); },
          .ended = [this, file = *options.file](const std::string& why) { serverHasEnded(file, why); }});
  const int status = _start.exec();
  if (!_trouble.empty()) throw std::runtime_error(_trouble);
  _services.connectTo(_server->folder());
  _firstTime = firstTimeOf(*options.file);
  _control = std::make_unique<ControlClient>(_server->folder());
  startOver();
  if (_server->isReady()) return;
  // The wish to end has ended the wait alone.
  QMetaObject::invokeMethod(
      QCoreApplication::instance(), [status] { QCoreApplication::exit(status); }, Qt::QueuedConnection);
}

void PlayedFile::startOver() {
  if (!_control) return;
  if (_firstTime) _services.playedClock().standAt(*_firstTime);
  _polling = _services.queue().repeating(intervalOfPlaying, [this] { followPlaying(); });
}

void PlayedFile::followPlaying() {
  if (_control->isWaiting()) return;
  _control->ask({}, [this](const std::optional<ControlReply>& reply) { take(reply); });
}

void PlayedFile::take(const std::optional<ControlReply>& reply) {
  const auto* const status = reply ? std::get_if<ServerStatus>(&*reply) : nullptr;
  if (!status || !status->time) return;
  const bool isAtEnd = status->position && status->length && *status->position >= *status->length;
  _services.playedClock().follow(*status->time, isAtEnd || status->isPaused ? 0 : status->speed);
  if (isAtEnd) _polling.reset();
}

void PlayedFile::serverHasEnded(const std::string& file, const std::string& why) {
  _polling.reset();
  _services.playedClock().stand();
  if (_server->isReady())
    return _services.link().setEndOfOwnServer("The server that plays " + printable(file) + " has ended: " +
                                              printable(why) + "; start varnel again to see the file again");
  _trouble = why;
  _start.quit();
}

}  // namespace varnel
