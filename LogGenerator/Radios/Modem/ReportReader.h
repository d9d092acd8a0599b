#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "LogGenerator/Packet.h"
#include "LogGenerator/PacketVersion.h"
#include "base/Bytes.h"
#include "base/Dictionary.h"
#include "base/Time.h"
#include "base/Value.h"

/// The telephony server's modem reports (`platform/ModemReport.h`), and what `all-radios` shows of them.
namespace varnel::modem {

/// A modem report.
struct Report {
  PacketVersion version;
  bool isKnown;               ///< this program knows the version; else the entries may mean anything
  const Dictionary* entries;  ///< valid until another packet is read
};

/// Reads modem reports for several decoders of one index. All of them get the same packet in turn, and it is
/// parsed only once.
class ReportReader {
 public:
  /// Nothing when the payload is no property list, no dictionary, or has no version.
  std::optional<Report> read(const Packet& packet);
  /// The packet that was read last, once more; nothing when none was.
  std::optional<Report> last() const;

 private:
  std::optional<Bytes> _payload;  // absent until a packet was read
  std::optional<Value> _content;
};

// Of an entry of a report. A value of another kind, or outside of the limits, counts as absent.

std::optional<std::int64_t> wholeNumber(const Dictionary& entries, std::string_view key, std::int64_t least,
                                        std::int64_t most);
std::optional<double> number(const Dictionary& entries, std::string_view key, double least, double most);
/// Empty where there is none.
std::string shortText(const Value& value);
/// The number of a network, as "262-01". Empty where there is none.
std::string network(const Dictionary& entries);

/// Where the modem was.
struct Position {
  double latitude, longitude;        ///< degrees of WGS 84; north and east are positive
  std::optional<double> altitude_m;  ///< above the sea
  std::optional<Time> time;          ///< of the fix
  std::string source;                ///< such as "GNSS"; empty when nobody tells
};

/// The entries of the display that show it. They tell where a person was, so they count as identities.
inline constexpr std::string_view latitudeEntry = "Latitude", longitudeEntry = "Longitude",
                                  altitudeEntry = "Altitude";

/// The position in a report of a known version.
std::optional<Position> positionIn(const Dictionary& report);

}  // namespace varnel::modem
