#include "programs/varnel/CaptureHistory.h"

#include <QFile>
#include <QProcessEnvironment>
#include <filesystem>
#include <utility>

#include "host/FileResources.h"
#include "host/Printable.h"
#include "programs/shared/Modules.h"

namespace varnel {

namespace {

constexpr std::size_t longestReason = 500;
// The last line says why.
constexpr qsizetype mostBytesOfErrors = 8192;

QString argument(const std::string& text) { return QFile::decodeName(QByteArray::fromStdString(text)); }

// The last line, without the name of the program.
std::string reasonIn(const QByteArray& errors) {
  const QByteArray last = errors.trimmed().split('\n').last();
  const qsizetype colon = last.indexOf(": ");
  std::string reason = printable(last.mid(colon < 0 ? 0 : colon + 2).toStdString());
  if (reason.size() <= longestReason) return reason;
  std::size_t size = longestReason;
  // A character of UTF-8 stays whole.
  while (size > 0 && (reason[size] & 0xC0) == 0x80) --size;
  return reason.substr(0, size);
}

}  // namespace

CaptureHistory::CaptureHistory(Wish wish)
    : _wish(std::move(wish)),
      _trends({.numbers = _numbers,
               .events = _events,
               .name = [this] { return std::filesystem::path(_wish.path).filename().string(); },
               .isDated = [this] { return _isDated; },
               .remark = [this] { return remark(); },
               .progress = [this] { return progress(); },
               .playedTime = _wish.playedTime,
               .input = [this] { return _wish.path; }}),
      _reader({.begin = [this](bool isDated) { _isDated = isDated; },
               .generation = [this](Time time, auto readings) { takeGeneration(time, readings); },
               .event = [this](DisplayEvent event) { takeEvent(std::move(event)); },
               .progress = [this](double share) { _progress = share; },
               .end = [this](const std::string& why) { end(why); }}) {
  QObject::connect(&_process, &QProcess::readyReadStandardOutput, &_process, [this] { takeBytes(); });
  QObject::connect(&_process, &QProcess::readyReadStandardError, &_process, [this] { takeErrors(); });
  QObject::connect(&_process, &QProcess::finished, &_process, [this] { processHasEnded(); });
  QObject::connect(&_process, &QProcess::errorOccurred, &_process, [this](QProcess::ProcessError error) {
    if (error == QProcess::FailedToStart) end("the program that reads it cannot be started; install it anew");
  });
  const std::string program =
      _wish.program.empty() ? companionFile("varnel-numbers", "libexec/varnel").string() : _wish.program;
  // The program is not where those of users are, so it would look for the resources in a wrong place.
  auto environment = QProcessEnvironment::systemEnvironment();
  environment.insert(QStringLiteral("VARNEL_RESOURCES"), argument(resourceFolder().string()));
  _process.setProcessEnvironment(environment);
  _process.setStandardInputFile(QProcess::nullDevice());
  _process.start(argument(program), {argument(_wish.path), argument(_wish.technology),
                                     _wish.subscription ? QString::number(*_wish.subscription) : QString()});
}

CaptureHistory::~CaptureHistory() {
  _process.disconnect();
  if (_process.state() == QProcess::NotRunning) return;
  _process.kill();
  _process.waitForFinished();
}

void CaptureHistory::takeBytes() {
  const QByteArray bytes = _process.readAllStandardOutput();
  if (_reader.take({bytes.data(), static_cast<std::size_t>(bytes.size())})) return;
  end("the program that reads it is of another version; install both anew");
  _process.kill();
}

void CaptureHistory::takeErrors() {
  _errors += _process.readAllStandardError();
  _errors = _errors.right(mostBytesOfErrors);
}

void CaptureHistory::takeGeneration(Time time, std::span<const ValueHistory::Reading> readings) {
  _numbers.add(readings, time);
  _isEmpty = false;
  _events.dropBefore(_numbers.whole().begin);
}

// The event comes after the display before it and before the next one.
void CaptureHistory::takeEvent(DisplayEvent event) {
  const auto newest = _numbers.whole().end;
  const auto since = durationBetween(_numbers.timeAt(newest), event.time);
  const bool isSoon = since > std::chrono::nanoseconds::zero() && since <= ValueHistory::longestStep;
  _events.add(std::move(event), isSoon ? newest + since : newest);
}

void CaptureHistory::processHasEnded() {
  takeBytes();
  if (_state == State::Done) return;
  takeErrors();
  const std::string reason = reasonIn(_errors);
  end(reason.empty() ? "the program that reads it has ended" : reason);
}

void CaptureHistory::end(std::string why) {
  if (_state == State::Done) return;
  _state = State::Done;
  _why = std::move(why);
}

std::optional<double> CaptureHistory::progress() const {
  return isReading() ? std::optional(_progress) : std::nullopt;
}

std::string CaptureHistory::remark() const {
  std::string remark;
  if (isReading())
    remark = "The file is being read: " + std::to_string(static_cast<int>(_progress * 100)) + " %";
  if (!_why.empty()) remark = "The trends end where the file cannot be read any further: " + printable(_why);
  // The axis begins at 0.
  if (_numbers.whole().begin > ValueHistory::Duration()) {
    remark += remark.empty() ? "" : ". ";
    remark += "The file is longer than what is kept: its beginning is left out";
  }
  return remark;
}

}  // namespace varnel
