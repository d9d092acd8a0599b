#include "programs/varnel-telephonyd/simulation/radios/LTEMessages.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/radios/PerWriter.h"

namespace varnel::simulation::lteMessages {

namespace {

// Numbers of the messages on their channels.
enum DownlinkDedicated { InformationTransfer = 1, Reconfiguration = 4, Release = 5, SecurityCommand = 6 };
enum UplinkDedicated {
  Measurement = 1,
  ReconfigurationComplete = 2,
  SetupComplete = 4,
  SecurityComplete = 5,
  UplinkTransfer = 9
};
constexpr int setupOnCommonChannel = 3, requestOnCommonChannel = 1;

constexpr unsigned transaction = 1;

// A channel's messages are a choice in a choice. The outer one leaves room for later messages.
PerWriter message(unsigned width, unsigned number) { return PerWriter().bits(1, 0).bits(width, number); }
PerWriter commonDownlink(unsigned number) { return message(2, number); }
PerWriter dedicated(unsigned number) { return message(4, number); }

// The first version of a message, of as many as these bits tell apart, in a choice like that of the channel.
PerWriter& firstVersion(PerWriter& message, unsigned width) { return message.bits(1, 0).bits(width, 0); }

void putDigits(PerWriter& message, int number, int digits) {
  int unit = 1;
  for (int digit = 1; digit < digits; ++digit) unit *= 10;
  for (; unit > 0; unit /= 10) message.bits(4, static_cast<unsigned>(number / unit % 10));
}

}  // namespace

Bytes systemInformationBlock1(const Cell& cell) {
  constexpr int firstTimeDivisionBand = 33, tddSubframes = 2, tddSpecial = 7;
  constexpr int minimumLevel_dbm = -124, lowest_dbm = -140, maximumPower_dbm = 23, lowestPower_dbm = -30;
  const bool isTimeDivision = cell.band >= firstTimeDivisionBand;
  PerWriter block = message(1, 1);
  block.bits(1, 1).bits(1, isTimeDivision).absent(1);  // maximum power, and what follows from the mode
  // The networks of the cell: one.
  block.absent(1).bits(3, 0).bits(1, 1);
  putDigits(block, cell.network.countryCode, 3);
  block.bits(1, cell.network.networkCodeDigits == 3);
  putDigits(block, cell.network.networkCode, cell.network.networkCodeDigits);
  block.bits(1, 1);  // not only for the operator
  block.bits(16, static_cast<unsigned>(cell.area)).bits(28, cell.identity);
  block.bits(1, 1).bits(1, 0).bits(1, 0);  // not barred, reselection is allowed, for everybody
  block.absent(1).bits(6, (minimumLevel_dbm - lowest_dbm) / 2);
  block.bits(6, maximumPower_dbm - lowestPower_dbm).bits(6, static_cast<unsigned>(cell.band) - 1);
  // One further message, with block 3, every 160 ms.
  block.bits(5, 0).bits(3, 1).bits(5, 1).bits(1, 0).bits(4, 0);
  if (isTimeDivision) block.bits(3, tddSubframes).bits(4, tddSpecial);
  block.bits(3, 4).bits(5, cell.identity % 32);  // 15 ms, the number of changes
  return block.finish();
}

Bytes paging(const TemporaryName& name) {
  return PerWriter()
      .bits(1, 0)
      .bits(1, 1)
      .absent(3)
      .bits(4, 0)  // one phone
      .absent(1)
      .bits(2, 0)
      .bits(8, static_cast<unsigned>(name.code))
      .bits(32, name.number)
      .bits(1, 0)  // for packets
      .finish();
}

Bytes connectionSetup() {
  PerWriter setup = commonDownlink(setupOnCommonChannel).bits(2, transaction);
  firstVersion(setup, 3).absent(1);
  // Only the first signaling bearer, of the usual kind.
  setup.absent(1).bits(1, 1).absent(5);
  return setup.bits(1, 0).absent(1).bits(2, 3).bits(1, 0).bits(1, 1).bits(1, 1).finish();
}

Bytes securityModeCommand() {
  constexpr unsigned secondAlgorithm = 2;
  PerWriter command = dedicated(SecurityCommand).bits(2, transaction);
  return firstVersion(command, 2)
      .absent(2)
      .bits(1, 0)
      .bits(3, secondAlgorithm)
      .bits(1, 0)
      .bits(3, secondAlgorithm)
      .finish();
}

Bytes connectionReconfiguration() {
  PerWriter reconfiguration = dedicated(Reconfiguration).bits(2, transaction);
  return firstVersion(reconfiguration, 3).absent(6).finish();
}

Bytes downlinkInformationTransfer(ByteView content) {
  PerWriter transfer = dedicated(InformationTransfer).bits(2, transaction);
  return firstVersion(transfer, 2).absent(1).bits(2, 0).octetString(content).finish();
}

Bytes connectionRelease() {
  constexpr unsigned other = 1;
  PerWriter release = dedicated(Release).bits(2, transaction);
  return firstVersion(release, 2).absent(3).bits(2, other).finish();
}

Bytes connectionReleaseToUMTS(int channel) {
  constexpr unsigned other = 1, frequencyDivision = 2;
  PerWriter release = dedicated(Release).bits(2, transaction);
  return firstVersion(release, 2)
      .bits(1, 1)
      .absent(2)
      .bits(2, other)
      .bits(1, 0)
      .bits(3, frequencyDivision)
      .bits(14, static_cast<unsigned>(channel))
      .finish();
}

Bytes connectionRequest(const TemporaryName& name, Cause cause) {
  return message(1, requestOnCommonChannel)
      .bits(1, 0)
      .bits(1, 0)
      .bits(8, static_cast<unsigned>(name.code))
      .bits(32, name.number)
      .bits(3, static_cast<unsigned>(cause))
      .bits(1, 0)
      .finish();
}

Bytes connectionSetupComplete(ByteView content) {
  PerWriter complete = dedicated(SetupComplete).bits(2, transaction);
  constexpr unsigned firstNetwork = 0;
  return firstVersion(complete, 2).absent(2).bits(3, firstNetwork).octetString(content).finish();
}

Bytes securityModeComplete() {
  return dedicated(SecurityComplete).bits(2, transaction).bits(1, 0).absent(1).finish();
}

Bytes connectionReconfigurationComplete() {
  return dedicated(ReconfigurationComplete).bits(2, transaction).bits(1, 0).absent(1).finish();
}

Bytes uplinkInformationTransfer(ByteView content) {
  PerWriter transfer = dedicated(UplinkTransfer);
  return firstVersion(transfer, 2).absent(1).bits(2, 0).octetString(content).finish();
}

// TS 36.133 9.1.4 and 9.1.7: steps of 1 dB above -141 dBm, and of half a decibel above -20 dB. What is left
// of a step does not count; shifts round down.
Bytes measurementReport(std::int64_t rsrp, std::int64_t rsrq) {
  constexpr std::int64_t mostRSRP = 97, mostRSRQ = 34;
  const std::int64_t level = std::clamp<std::int64_t>((rsrp >> 4) + 141, 0, mostRSRP);
  const std::int64_t quality = std::clamp<std::int64_t>((rsrq >> 3) + 40, 0, mostRSRQ);
  PerWriter report = dedicated(Measurement);
  return firstVersion(report, 3)
      .absent(3)
      .bits(5, 0)
      .bits(7, static_cast<unsigned>(level))
      .bits(6, static_cast<unsigned>(quality))
      .finish();
}

}  // namespace varnel::simulation::lteMessages
