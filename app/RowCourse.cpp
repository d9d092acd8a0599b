#include "app/RowCourse.h"

#include <unordered_set>

namespace varnel {

namespace {

constexpr std::size_t columns = 24;
constexpr ValueHistory::Duration columnLength = std::chrono::seconds(10);

// In any section: none of these names is that of a measure elsewhere.
const std::unordered_set<std::string_view>& identities() {
  static const std::unordered_set<std::string_view> all = {
      // Packets
      "Version",
      // Cells
      "Base Station ID",
      "BCC",
      "BSIC",
      "BSIC ID",
      "Cell",
      "Cell ID",
      "Cell Identity",
      "Cell Scrambling Code",
      "eNB",
      "NCC",
      "Physical Cell ID",
      "Pilot",
      "PN",
      "PSC",
      "Scrambling Code",
      "Serving Cell",
      "Serving Cell ID",
      "Serving Physical Cell ID",
      "Serving Pilot PN Offset",
      "SSB",
      // Channels and bands
      "ARFCN",
      "Band",
      "Band Class",
      "Band Indicator",
      "Carrier",
      "Channel",
      "Downlink Frequency",
      "Downlink UARFCN",
      "Download Frequency",
      "E ARFCN",
      "E-ARFCN",
      "EARFCN",
      "Freq Band Indicator",
      "Frequency",
      "MA Dedicated ARFCN",
      "NR-ARFCN",
      "Rx0 Band Class",
      "Rx0 Channel",
      "Rx1 Band Class",
      "Rx1 Channel",
      "Serving EARFCN",
      "U ARFCN",
      "UARFCN",
      "Upload Frequency",
      "Uplink EARFCN",
      "Uplink Frequency",
      "Uplink NR-ARFCN",
      "Uplink UARFCN",
      // Networks and areas
      "AMF Pointer",
      "AMF Region",
      "AMF Set",
      "Color Code",
      "LAC",
      "Local Area Code",
      "Location Area Code",
      "MME Code",
      "MME Group",
      "Mobile Country Code",
      "Mobile Network Code",
      "Network ID",
      "Packet Zone ID",
      "Protocol Revision",
      "Routing Area Code",
      "System ID",
      "Tracking Area Code",
      "URA ID",
      // Phones
      "5G-TMSI",
      "C-RNTI",
      "EF-ICCID",
      "EF-MSISDN",
      "M-TMSI",
      "Number",
      "P-TMSI",
      "RA-RNTI",
      "Temporary C-RNTI",
      "TMSI",
      "UATI24",
      // Parts of a connection
      "Bearer ID",
      "CCTRCH ID",
      "Connection ID",
      "Context ID",
      "Preamble",
      "Process ID",
      "Root Sequence",
      "Timeslot",
      "Transport Channel ID",
      "TRCH ID",
      "TSNUM",
  };
  return all;
}

// The last moment within the length of the line at which the value became another one, or came back; the
// last sample's when it stood all the time, so that the line is flat. Nothing without samples.
std::optional<ValueHistory::Duration> lastChange(const ValueHistory& history, ValueHistory::Number series,
                                                 ValueHistory::Duration until) {
  const auto samples = history.samples(series, {until - columns * columnLength, until});
  for (std::size_t i = samples.size(); i-- > 0;) {
    const bool isChange = samples[i].followsGap || (i > 0 && samples[i].value != samples[i - 1].value);
    if (isChange) return samples[i].at;
  }
  return samples.empty() ? std::nullopt : std::optional(samples.back().at);
}

}  // namespace

bool isIdentity(std::string_view rowName) { return identities().contains(rowName); }

std::vector<std::optional<double>> recentCourse(const ValueHistory& history, const VarnelModelNode& row) {
  const auto series = history.seriesOf(row);
  if (!series) return {};
  return recentCourse(history, *series, history.whole().end);
}

std::vector<std::optional<double>> recentCourse(const ValueHistory& history, ValueHistory::Number series,
                                                ValueHistory::Duration until) {
  const auto newest = lastChange(history, series, until);
  if (!newest) return {};
  // A stretch has its end, but not its beginning.
  const auto begun = *newest / columnLength + (*newest % columnLength == ValueHistory::Duration() ? 0 : 1);
  const auto end = begun * columnLength;
  const ValueHistory::Stretch stretch{end - columns * columnLength, end};
  auto found = history.columns(series, stretch, columns);
  if (until < end) {
    const ValueHistory::Stretch last{end - columnLength + ValueHistory::Duration(1), until};
    found.back() = history.columns(series, last, 1).front();
  }
  std::vector<std::optional<double>> course;
  course.reserve(columns);
  for (const auto& column : found)
    course.push_back(column.isEmpty ? std::nullopt : std::optional(column.last));
  return course;
}

}  // namespace varnel
