#include "LogGenerator/Radios/LTE/RandomAccess.h"

#include "LogGenerator/NumberFormats.h"

namespace varnel::lte {

namespace {

constexpr Format dBm = integer("%d dBm");
constexpr Format milliseconds = integer("%u ms");
constexpr Format unknown = integer("Unknown (%u)");

// A step of the timing advance is 16 Ts, there and back (3GPP TS 36.213, 4.2.3): 78.1 m of distance.
constexpr Format distance = real("%.0f m", 78.1);

constexpr std::string_view reasons[] = {"Connection Request", "Radio Link Failure", "Uplink Data",
                                        "Downlink Data", "Handover"};
constexpr std::uint32_t failureAtMessage2 = 1;
constexpr Choice results[] = {{0, "Success"}, {failureAtMessage2, "Failure at Message 2"}, {4, "Aborted"}};
constexpr std::string_view contention[] = {"No", "Yes"};

// The offsets of subpackets count from their first byte, with the four of id, version and size.
constexpr Field configuration[] = {
    {s16(4), "Preamble Initial Power", dBm},
    {u8(6), "Power Ramping", integer("%d dB")},
    {u8(9), "Maximum Preamble Transmissions"},
    {u16(10), "Contention Resolution Timer", milliseconds},
    {s16(15), "P-Max", dBm},
    {u8(19), "PRACH Configuration"},
    {u16(21), "Root Sequence"},
    {u8(25), "Maximum Message 3 Transmissions"},
    {u8(26), "Response Window"},
};

constexpr Field reason[] = {
    {u8(4), "Reason", entry(reasons, unknown)},
    {u8(11), "Contention", entry(contention, unknown)},
    {u8(12), "Preamble"},
    {u8(16), "Path Loss", integer("%d dB")},
    {u16(17), "C-RNTI"},
};

constexpr std::size_t resultOffset = 1;
constexpr Field attempt[] = {
    {u8(0), "Attempt"},
    {u8(resultOffset), "Result", choice(results, unknown)},
    {u8(2), "Contention", entry(contention, unknown)},
    {u8(4), "Preamble"},
};
constexpr Field response[] = {
    {u16(0), "Backoff", milliseconds},
    {u16(3), "Temporary C-RNTI"},
    {u16(5), "Timing Advance"},
    {u16(5), "Distance", distance},
};
// With the grant, which is not shown.
constexpr std::size_t responseSize = 14;

// Newer versions put the subscription and the cell in front of the attempt. The newest one has a longer
// preamble part between the attempt and the response.
template <std::size_t attemptOffset, std::size_t responseOffset>
void updateAttempt(Section& section, const Packet& subpacket) {
  const Packet attemptPart = subpacket.from(attemptOffset);
  section.show(attemptPart, attempt);
  if (attemptPart.u8(resultOffset) != failureAtMessage2)
    return section.show(subpacket.from(responseOffset), response);
  // Message 2 is the response. What an earlier procedure got would be taken for the one of this attempt.
  for (const Field& field : response) section.setText(field.label, "");
}

constexpr Field rootSequence[] = {
    {bits(2, 0, 10), "Root Sequence"},
    {bits(3, 2, 6), "PRACH Configuration"},
};

constexpr Field transmission[] = {
    {bits(4, 0, 6), "Preamble"},
    {s8(8), "Transmit Power", dBm},
    {u16(20), "RA-RNTI"},
};

constexpr Field receivedResponse[] = {
    {bits(4, 0, 10), "System Frame Number"}, {bits(5, 2, 4), "Subframe"},  {bits(6, 0, 11), "Timing Advance"},
    {bits(6, 0, 11), "Distance", distance},  {u16(9), "Temporary C-RNTI"},
};

constexpr Field contentionResolution[] = {
    {bits(4, 0, 10), "System Frame Number"},
    {bits(5, 2, 4), "Subframe"},
};

constexpr PacketLayout layouts[] = {
    PacketLayout(0xB061, 1, 28, configuration).inSubpacket(3, 2),
    PacketLayout(0xB061, 1, 20, reason).inSubpacket(5, 1),
    PacketLayout(0xB062, 1, 12 + responseSize, updateAttempt<4, 12>).inSubpacket(6, 2),
    PacketLayout(0xB062, 1, 14 + responseSize, updateAttempt<6, 14>).inSubpacket(6, 3),
    PacketLayout(0xB062, 1, 14 + responseSize, updateAttempt<6, 14>).inSubpacket(6, 49),
    PacketLayout(0xB062, 1, 17 + responseSize, updateAttempt<6, 17>).inSubpacket(6, 50),
    {0xB166, 3, 4, rootSequence},
    {0xB167, 5, 28, transmission},
    {0xB168, 1, 12, receivedResponse},
    {0xB16A, 1, 6, contentionResolution},
};

}  // namespace

RandomAccess::RandomAccess() : VersionedDecoder("Random Access", layouts) {}

void RandomAccess::listNumberFormats(SectionFormats& formats) const {
  VersionedDecoder::listNumberFormats(formats);
  formats.add(attempt);
  formats.add(response);
}

}  // namespace varnel::lte
