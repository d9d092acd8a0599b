#include "programs/varnel-telephonyd/simulation/radios/NRMessages.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/radios/PackedNetwork.h"
#include "programs/varnel-telephonyd/simulation/radios/PerWriter.h"

namespace varnel::simulation::nrMessages {

namespace {

enum Discriminator : std::uint8_t { Session = 0x2E, Mobility = 0x7E };
enum Dedicated { Measurement = 0, SetupComplete = 2, Release = 2 };
constexpr unsigned setupOnCommonChannel = 1, requestOnCommonChannel = 0;

constexpr unsigned transaction = 2;

// A group of cells that changes nothing.
Bytes emptyCellGroup() { return PerWriter().bits(1, 0).absent(7).bits(2, 0).finish(); }

PerWriter message(unsigned width, unsigned number) { return PerWriter().bits(1, 0).bits(width, number); }

}  // namespace

Bytes masterInformation(std::int64_t frame) {
  constexpr unsigned spacing30kHz = 1;
  return PerWriter()
      .bits(1, 0)
      .bits(6, static_cast<std::uint64_t>(frame) >> 4)  // the physical channel carries the other bits
      .bits(1, spacing30kHz)
      .bits(4, 6)
      .bits(1, 0)
      .bits(8, 0x65)
      .bits(1, 1)  // not barred
      .bits(1, 0)
      .bits(1, 0)
      .finish();
}

Bytes reconfiguration() {
  return PerWriter()
      .bits(2, transaction)
      .bits(1, 0)
      .absent(1)
      .bits(1, 1)
      .absent(3)
      .octetString(emptyCellGroup())
      .finish();
}

Bytes reconfigurationComplete() { return PerWriter().bits(2, transaction).bits(1, 0).absent(2).finish(); }

// TS 38.133 10.1.6 and 10.1.11: steps of 1 dB above -157 dBm, and of half a decibel above -43 dB. Shifts
// round down.
Bytes measurementReport(const Cell& cell, std::int64_t rsrp, std::int64_t rsrq) {
  constexpr std::int64_t most = 127;
  const std::int64_t level = std::clamp<std::int64_t>((rsrp >> 7) + 157, 0, most);
  const std::int64_t quality = std::clamp<std::int64_t>((rsrq >> 6) + 87, 0, most);
  PerWriter report = message(4, Measurement).bits(1, 0).absent(2);
  // One serving cell and no neighbors.
  report.absent(2).bits(6, 0).bits(5, 0).absent(2).bits(5, 0);
  report.absent(1).bits(1, 1).bits(10, static_cast<unsigned>(cell.code));
  report.absent(1).bits(1, 1).absent(1);
  return report.bits(1, 1)
      .bits(1, 1)
      .absent(1)
      .bits(7, static_cast<unsigned>(level))
      .bits(7, static_cast<unsigned>(quality))
      .finish();
}

Bytes setupRequest(const TemporaryName& name) {
  constexpr unsigned signaling = 3;
  const std::uint64_t lowPart = std::uint64_t{static_cast<unsigned>(name.code)} << 32 | name.number;
  return message(2, requestOnCommonChannel)
      .bits(1, 0)
      .bits(39, lowPart)
      .bits(4, signaling)
      .bits(1, 0)
      .finish();
}

Bytes setup() {
  return message(2, setupOnCommonChannel)
      .bits(2, transaction)
      .bits(1, 0)
      .absent(2)
      .absent(6)
      .octetString(emptyCellGroup())
      .finish();
}

Bytes setupComplete(ByteView content) {
  constexpr unsigned firstNetwork = 0;
  return message(4, SetupComplete)
      .bits(2, transaction)
      .bits(1, 0)
      .absent(6)
      .bits(4, firstNetwork)
      .octetString(content)
      .finish();
}

Bytes release() { return message(4, Release).bits(2, transaction).bits(1, 0).absent(6).finish(); }

Bytes registrationRequest(const TemporaryName& name) {
  constexpr std::uint8_t globallyUnique = 0xF2;
  const std::array<std::uint8_t, 3> network = packedNetwork(name.network);
  const std::uint32_t set = static_cast<std::uint32_t>(name.group) & 0x3FF;
  const auto byte = [](std::uint32_t number) { return static_cast<std::uint8_t>(number); };
  return {Mobility,
          0x00,
          0x41,
          0x09,  // an initial registration, with the first key
          0x00,
          11,
          globallyUnique,
          network[0],
          network[1],
          network[2],
          byte(static_cast<std::uint32_t>(name.group) >> 10),
          byte(set >> 2),
          byte(set << 6 | static_cast<std::uint32_t>(name.code)),
          byte(name.number >> 24),
          byte(name.number >> 16),
          byte(name.number >> 8),
          byte(name.number)};
}

Bytes registrationAccept() { return {Mobility, 0x00, 0x42, 0x01, 0x01}; }
Bytes registrationComplete() { return {Mobility, 0x00, 0x43}; }

Bytes sessionRequest() { return {Session, 0x01, 0x01, 0xC1, 0xFF, 0xFF, 0x91}; }

// A session for IPv4, a rule for everything, and 100 Mbit/s both ways.
Bytes sessionAccept() {
  return {Session, 0x01, 0x01, 0xC2, 0x11, 0x00, 0x09, 0x01, 0x00, 0x06, 0x31, 0x31,
          0x01,    0x01, 0xFF, 0x01, 0x06, 0x06, 0x00, 0x64, 0x06, 0x00, 0x64};
}

}  // namespace varnel::simulation::nrMessages
