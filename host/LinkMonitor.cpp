#include "host/LinkMonitor.h"

#include <algorithm>
#include <cerrno>
#include <iterator>
#include <system_error>
#include <utility>
#include <vector>

#include "host/StreamReport.h"
#include "host/Subscription.h"
#include "host/TelephonyProtocol.h"

namespace varnel {

namespace {

namespace protocol = telephonyProtocol;

constexpr std::string_view startServer = "start varnel-telephonyd, or name its folder with --runtime-dir";
constexpr std::string_view startServerAgain = "end varnel-telephonyd and start it again";
constexpr std::string_view useOwnServer =
    "start varnel-telephonyd as this user, and both programs with a --runtime-dir of their own";
constexpr std::string_view endOthers = "end one of the programs that are connected to it";

// A reason with its code, and what a user can do about it. "%" stands for the folder.
struct Cause {
  std::int64_t code;
  std::string_view what, whatToDo;
};

constexpr Cause connectCauses[] = {
    {ENOENT, "no telephony server serves in %", startServer},
    {ECONNREFUSED, "the telephony server in % has ended", startServer},
    {EAGAIN, "the telephony server in % takes no connections", startServerAgain},
    {EACCES, "this user may not connect to the telephony server in %", useOwnServer},
    {EPERM, "the telephony server in % belongs to another user", useOwnServer},
};

constexpr Cause channelCauses[] = {
    {protocol::missingRights, "the telephony server in % gives this user no log channel",
     // An older server also refuses its own user, for it waits for rights that viewers name.
     "if it is this user's own, end it and start it again, else become a member of the group that its option "
     "--allow-group names"},
    {protocol::noReply, "the telephony server in % does not answer", startServerAgain},
    {protocol::malformedReply, "the telephony server in % cannot be understood",
     "use programs of one version"},
    {protocol::viewerPortMissing, "the telephony server in % cannot reach this viewer",
     "start both with the same --runtime-dir"},
    {protocol::tooManyChannels, "the telephony server in % serves as many viewers as it can",
     "end one of them"},
    {protocol::tooManyConnections, "the telephony server in % has as many connections as it takes",
     endOthers},
};

const Cause* causeOf(std::int64_t code, std::span<const Cause> causes) {
  const auto found = std::ranges::find(causes, code, &Cause::code);
  return found == causes.end() ? nullptr : std::to_address(found);
}

std::string asSentence(std::string_view text) {
  std::string sentence(text);
  if (!sentence.empty() && sentence[0] >= 'a' && sentence[0] <= 'z')
    sentence[0] = static_cast<char>(sentence[0] - 'a' + 'A');
  return sentence;
}

}  // namespace

LinkReport LinkMonitor::linkReport() const {
  LinkReport report = _report;
  report.place = _folder.string();
  if (!report.trouble.empty() && !_endOfOwnServer.empty()) report.trouble = _endOfOwnServer;
  report.mixture = mixture();
  return report;
}

std::string LinkMonitor::mixture() const {
  if (_shownSubscriptions.count() < 2) return {};
  std::vector<std::uint8_t> numbers;
  for (unsigned number = 0; number < _shownSubscriptions.size(); ++number)
    if (_shownSubscriptions.test(number)) numbers.push_back(static_cast<std::uint8_t>(number));
  return "The display mixes what the modems of " + subscriptionNames(numbers) +
         " send; to see one of them alone, start varnel with --sim " + std::to_string(numbers.front());
}

void LinkMonitor::looksInto(std::filesystem::path runtimeFolder, std::string obstacle) {
  _folder = std::move(runtimeFolder);
  _obstacle = std::move(obstacle);
}

void LinkMonitor::linkIsOpen() {
  _report = {};
  _shownSubscriptions.reset();
}

void LinkMonitor::tell(std::string_view what, std::string_view whatToDo) {
  _report.trouble = asSentence(what);
  if (const auto at = _report.trouble.find('%'); at != std::string::npos)
    _report.trouble.replace(at, 1, _folder.string());
  if (!whatToDo.empty()) _report.trouble.append("; ").append(whatToDo);
  if (!_obstacle.empty()) _report.trouble.append("; ").append(_obstacle);
}

void LinkMonitor::portNameIsTaken() {
  tell("another viewer is at work in %",
       "end it, or give this one and a server a folder of their own with --runtime-dir");
}

void LinkMonitor::failed(std::string_view reason) { _report.trouble = asSentence(reason); }

void LinkMonitor::serverIsOutOfReach(int systemError) {
  if (const Cause* const cause = causeOf(systemError, connectCauses))
    return tell(cause->what, cause->whatToDo);
  tell("the telephony server in % cannot be reached: " + std::generic_category().message(systemError),
       startServerAgain);
}

void LinkMonitor::channelWasRefused(std::int64_t error) {
  if (const Cause* const cause = causeOf(error, channelCauses)) return tell(cause->what, cause->whatToDo);
  tell("the telephony server in % made no log channel (error " + std::to_string(error) + ")",
       "its log lines say why");
}

void LinkMonitor::commandWentUnanswered() { channelWasRefused(protocol::noReply); }

void LinkMonitor::takeStreamReport(ByteView bytes) {
  const auto report = readStreamReport(bytes);
  if (!report) return;
  _report.serverNote = asSentence(report->note);
  _report.droppedByServer = report->dropped;
  _report.tooLongForChannel = report->tooLong;
}

}  // namespace varnel
