#include "LogGenerator/Radios/LTE/Connection.h"

#include <string>

#include "LogGenerator/Radios/ShownNumber.h"

namespace varnel::lte {

namespace {

constexpr std::string_view stateEntry = "RRC State", countEntry = "RRC Connections";

// Whether the name is the message's, also in the variant of NB-IoT and of the release that brought it.
bool is(std::string_view name, std::string_view message) {
  return name.starts_with(message) && (name.size() == message.size() || name[message.size()] == '-');
}

}  // namespace

void Connection::take(const AirMessageReading& reading) {
  const Dictionary* const entries = sectionRef.container().dictionary();
  if (!reading.message || !entries) return;
  const std::string_view name = reading.message->name;
  // Most messages are of other kinds.
  const bool mayChange = name.starts_with("RRCConnection");
  // A phone that another radio takes over leaves its LTE connection (3GPP TS 36.331, 5.4.3.4). If it does not
  // get there, it re-establishes the connection.
  if (is(name, "MobilityFromEUTRACommand")) return sectionRef.setText(stateEntry, "Idle");
  // A phone that may not re-establish its connection has lost it (3GPP TS 36.331, 5.3.7.8).
  if (mayChange && (is(name, "RRCConnectionRelease") || is(name, "RRCConnectionReject") ||
                    is(name, "RRCConnectionReestablishmentReject")))
    return sectionRef.setText(stateEntry, "Idle");
  if (!is(reading.message->channel, "DL-DCCH") && !is(reading.message->channel, "UL-DCCH")) return;
  sectionRef.setText(stateEntry, "Connected");
  if (mayChange && (is(name, "RRCConnectionSetupComplete") || is(name, "RRCConnectionResumeComplete")))
    sectionRef.setText(countEntry,
                       std::to_string(shownNumber<std::uint32_t>(entries->get(countEntry)).value_or(0) + 1));
}

}  // namespace varnel::lte
