#include "app/NoticeKeeper.h"

#include <utility>

#include "app/DateFormatter.h"
#include "app/Snapshot.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;
using Matter = Notice::Matter;

// Most links open at once. A user who waits longer wants to know why.
constexpr std::chrono::milliseconds patience = 3s;
constexpr std::chrono::milliseconds timeToReadOfSaving = 30s;
constexpr std::string_view momentPattern = "yyyy-MM-dd 'at' HH:mm:ss";

std::string quoted(const std::string& technology) { return '"' + technology + '"'; }

std::string knownTechnologies() {
  std::string names;
  for (const std::string_view name : LogGenerator::technologies()) {
    if (!names.empty()) names += ", ";
    names += name;
  }
  return names;
}

// A line that tells the count; nothing for a count of 0.
std::string countLine(std::string_view which, std::uint64_t count) {
  return count == 0 ? std::string() : std::string(which) + ": " + std::to_string(count);
}

}  // namespace

NoticeKeeper::NoticeKeeper(const ModelServices& services, std::string wayToStartOver,
                           std::function<void()> observer)
    : _services(services), _wayToStartOver(std::move(wayToStartOver)), _observer(std::move(observer)) {}

void NoticeKeeper::begin(const VarnelModel& model) {
  end();
  _model = &model;
  awaitLink();
}

void NoticeKeeper::end() {
  _model = nullptr;
  _wasConnected = false;
  _patience.reset();
  _endOfSaving.reset();
  _notice.clear();
  _historyLine.clear();
}

void NoticeKeeper::awaitLink() {
  _patience = _services.queue.repeating(patience, [this] {
    _patience.reset();
    if (update()) _observer();
  });
}

bool NoticeKeeper::update() {
  if (!_model) return false;
  const bool isConnected = _model->isConnected();
  if (std::exchange(_wasConnected, isConnected) && !isConnected) awaitLink();
  const LinkReport report = linkReport();
  const std::pair<Matter, std::string> lines[] = {
      {Matter::Link, linkLine(report)},
      {Matter::MissingTemplate, templateLine()},
      {Matter::StandingDisplay, standingLine()},
      {Matter::Mixture, mixtureLine(report)},
      {Matter::Source, report.serverNote},
      {Matter::DroppedByServer, countLine("Messages that the server dropped, since they were read too slowly",
                                          report.droppedByServer)},
      {Matter::TooLong, countLine("Messages too long for the log channel", report.tooLongForChannel)},
      {Matter::History, _historyLine},
      {Matter::LeftOutOfLog,
       countLine("Messages that a snapshot's binary log lacks, since too many came at a time",
                 _model->messagesLeftOutOfLog())},
      {Matter::NotDecoded, countLine("Messages of a log code, version, or length that no decoder knows",
                                     _model->messagesNotDecoded())},
  };
  bool hasChanged = false;
  for (const auto& [matter, line] : lines) hasChanged |= _notice.set(matter, line);
  return hasChanged;
}

LinkReport NoticeKeeper::linkReport() const {
  return _services.linkReports ? _services.linkReports->linkReport() : LinkReport();
}

std::string NoticeKeeper::linkLine(const LinkReport& report) const {
  if (_patience) return {};
  if (!_model->isConnected()) return failureLine(report);
  if (_model->hasHistory()) return {};
  return "Connected to a modem of the technology " + quoted(_model->technology()) +
         ", but nothing has arrived yet";
}

// The host's reason comes before the model's, except when the server has named an unknown technology.
std::string NoticeKeeper::failureLine(const LinkReport& report) const {
  const std::string server = "The telephony server" + (report.place.empty() ? "" : " in " + report.place);
  if (_model->streamFailure() == StreamFailure::UnknownTechnology) {
    return server + " has a modem of the technology " + quoted(_model->technology()) +
           ", which this viewer does not know; start varnel-telephonyd anew with one of " +
           knownTechnologies();
  }
  if (!report.trouble.empty()) return report.trouble;
  if (_model->streamFailure() == StreamFailure::NoTechnology)
    return server + " does not tell the technology of its modem; start varnel-telephonyd anew";
  return server + " cannot be reached; start varnel-telephonyd";
}

std::string NoticeKeeper::templateLine() const {
  const auto file = _model->missingTemplate();
  if (!file) return {};
  return "There is no display without the template " + *file +
         ", which cannot be loaded; install Varnel anew, or let VARNEL_RESOURCES name a folder that has it";
}

std::string NoticeKeeper::standingLine() const {
  const auto& display = _model->standingDisplay();
  if (!display) return {};
  const std::string since =
      DateFormatter(momentPattern).string(display->since, _services.generator.clock.zoneAt(display->since));
  const std::string cause = display->technology == _model->technology()
                                ? "when the link was opened anew"
                                : "for it is that of " + quoted(display->technology) +
                                      " and the modem's technology is now " + quoted(_model->technology());
  return "The display stands still since " + since + ", " + cause + "; " + _wayToStartOver + " to start over";
}

// All radios have a group for each SIM card. Without a technology there is no display.
std::string NoticeKeeper::mixtureLine(const LinkReport& report) const {
  const std::string& technology = _model->technology();
  return technology.empty() || technology == technology::allRadios ? std::string() : report.mixture;
}

void NoticeKeeper::snapshotWasWritten(const FileWriting& writing) {
  if (!writing.isDone()) return tellOfSaving("Not saved: " + writing.place + ": " + writing.failure);
  std::string line = "Saved: " + writing.place;
  if (writing.hasReplaced) line += ", in place of the snapshot of the same second";
  if (_model && !_model->hasHistory()) line += "; it is empty, for nothing has arrived yet";
  tellOfSaving(line);
}

void NoticeKeeper::snapshotIsNotAllowed() {
  tellOfSaving("Not saved: this device allows no snapshots, for it has no " +
               std::string(internalDeviceMarker));
}

void NoticeKeeper::snapshotIsOpen() { tellOfSaving("Not saved: what is shown comes from a snapshot"); }

void NoticeKeeper::snapshotIsWanted() {
  if (_model && !_model->hasHistory()) tellOfSaving("Nothing has arrived yet: a snapshot saved now is empty");
}

void NoticeKeeper::tellOfSaving(const std::string& line) {
  _notice.set(Matter::Saving, line);
  _endOfSaving = _services.queue.repeating(timeToReadOfSaving, [this] {
    _endOfSaving.reset();
    if (_notice.set(Matter::Saving, {})) _observer();
  });
  _observer();
}

}  // namespace varnel
