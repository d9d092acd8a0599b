#include "PacketCases.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <ostream>
#include <vector>

#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"
#include "LogGenerator/KLV/LTE/LTEClassIndex.h"
#include "LogGenerator/KLV/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/LogMessage.h"
#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"

namespace varnel {

namespace {

// A modem packet whose payload has small and large bytes.
Bytes packet(std::uint16_t logCode, std::size_t size) {
  Bytes bytes(size);
  for (std::size_t i = 0; i < size; ++i) bytes[i] = static_cast<std::uint8_t>(i * 37 + 11);
  bytes[0] = 1;
  bytes[3] = static_cast<std::uint8_t>(logCode);
  bytes[4] = static_cast<std::uint8_t>(logCode >> 8);
  return bytes;
}

Bytes lteServingCell() { return packet(0xB0C2, 38); }

Bytes lteServingCellMeasurement() { return packet(0xB17F, 33); }

Bytes lteNeighborsOf8Cells() {
  Bytes bytes = packet(0xB180, 21 + 8 * 20);
  bytes[19] = 0xC0;  // the number of cells minus one is 7: two bits here,
  bytes[20] = 0x01;  // three there
  return bytes;
}

Bytes lteConnectedModeOf8Neighbors() {
  Bytes bytes = packet(0xB179, 29 + 8 * 6);
  bytes[27] = 8;
  bytes[28] = 0;
  return bytes;
}

Bytes utranNeighborsOf16Cells() {
  Bytes bytes = packet(0xD00A, 168 + 16 * 16);
  bytes[16] = 16 << 1;
  return bytes;
}

Bytes gsmUMTSCellSetOf8Cells() {
  constexpr std::size_t count = 8;
  Bytes bytes = packet(0x417A, 16 + count * (15 + 44));
  bytes[15] = count;
  for (std::size_t i = 0; i < count; ++i) bytes[16 + 15 * i + 8] &= 0x1F;  // all in the active set
  return bytes;
}

Bytes gsmUMTSMeasurementOf6Neighbors() {
  Bytes bytes = packet(0x5137, 29 + 6 * 14);
  bytes[28] = 6;
  return bytes;
}

Bytes gsmUMTSRegistration() {
  Bytes bytes = packet(0x7132, 16);
  bytes[13] = 1;
  bytes[14] = 0;
  return bytes;
}

Bytes c2k1xStatusOf6Pilots() {
  constexpr std::size_t subpacketSizes[] = {8, 16, 24 + 6 * 12 + 2, 8};
  Bytes bytes = packet(0x119C, 17 + 8 + 16 + 98 + 8);
  bytes[14] = 4;
  std::size_t start = 17;
  std::uint8_t id = 1;
  for (const std::size_t size : subpacketSizes) {
    bytes[start] = id++;
    bytes[start + 2] = static_cast<std::uint8_t>(size);
    bytes[start + 3] = 0;
    start += size;
  }
  bytes[17 + 4] = 8;  // traffic
  const std::size_t activeSet = 17 + 8 + 16;
  bytes[activeSet + 7] = 10;  // exponent
  bytes[activeSet + 8] = 6;
  bytes[activeSet + 9] = 0;  // no extensions: a pilot has 12 bytes
  return bytes;
}

void raise(Bytes& bytes, std::size_t offset, std::uint32_t difference) {
  std::uint32_t number = 0;
  std::memcpy(&number, bytes.data() + offset, sizeof number);
  number += difference;
  std::memcpy(bytes.data() + offset, &number, sizeof number);
}

// Each packet has the next sequence value, and a higher first counter.
Bytes c2kForwardLink() { return packet(0x1192, 241); }
void advanceForwardLink(Bytes& bytes) {
  raise(bytes, 13, 1);
  raise(bytes, 17, 1200);
}

Bytes c2kReverseLink() { return packet(0x127E, 1750); }
void advanceReverseLink(Bytes& bytes) {
  raise(bytes, 14, 1);
  raise(bytes, 18, 1200);
}

Bytes cellMonitorOf16Records(std::string_view access) {
  Value cells = Value::ofArray();
  for (int i = 0; i < 16; ++i) {
    Value cell = Value::ofDictionary();
    cell.dictionary()->set(cellMonitor::radioAccessTechnology, access);
    cell.dictionary()->set(cellMonitor::cellType, i < 15 ? cellMonitor::neighbor : cellMonitor::serving);
    cell.dictionary()->set(cellMonitor::trackingAreaCode, Value::ofInteger(4711));
    cell.dictionary()->set(cellMonitor::cellIdentity, Value::ofInteger(0x1234500 + i));
    cell.dictionary()->set(cellMonitor::physicalCellIdentity, Value::ofInteger(100 + i));
    cell.dictionary()->set(cellMonitor::bandInfo, Value::ofInteger(3));
    cell.dictionary()->set(cellMonitor::uarfcn, Value::ofInteger(1300));
    cells.array()->push_back(cell);
  }
  Bytes bytes{0xFF, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 0};
  const Bytes list = *writeXmlPropertyList(cells);
  bytes.insert(bytes.end(), list.begin(), list.end());
  return bytes;
}

Bytes lteCellMonitor() { return cellMonitorOf16Records(cellMonitor::lte); }

Bytes gsmUMTSCellMonitor() { return cellMonitorOf16Records(cellMonitor::umts); }

std::vector<PacketCase> fullPackets() {
  return {
      {"LTE 0xB0C2", technology::kalviLTE, lteServingCell},
      {"LTE 0xB17F", technology::kalviLTE, lteServingCellMeasurement},
      {"LTE 0xB180, 8 cells", technology::kalviLTE, lteNeighborsOf8Cells},
      {"LTE 0xB179, 8 neighbours", technology::kalviLTE, lteConnectedModeOf8Neighbors},
      {"UTRAN 0xD00A, 16 cells", technology::kalviUTRAN2, utranNeighborsOf16Cells},
      {"LTE cell monitor, 16 records", technology::kalviLTE, lteCellMonitor},
      {"GSM/UMTS 0x417A, 8 cells, 4 sections", technology::kalviGSMUMTS, gsmUMTSCellSetOf8Cells},
      {"GSM/UMTS 0x5137, 6 neighbours, 4 sections", technology::kalviGSMUMTS, gsmUMTSMeasurementOf6Neighbors},
      {"GSM/UMTS 0x7132, 4 sections", technology::kalviGSMUMTS, gsmUMTSRegistration},
      {"GSM/UMTS cell monitor, 16 records, 5 sections", technology::kalviGSMUMTS, gsmUMTSCellMonitor},
      {"C2K 0x119c, 6 pilots", technology::kalviCDMA, c2k1xStatusOf6Pilots},
      {"C2K 0x1192", technology::kalviCDMA, c2kForwardLink, advanceForwardLink},
      {"C2K 0x127e", technology::kalviCDMA, c2kReverseLink, advanceReverseLink},
  };
}

Bytes zeros(std::uint32_t logCode, std::size_t size) {
  Bytes bytes(std::max(size, Packet::headerSize));
  bytes[0] = LogMessage::modemLogType;
  bytes[LogMessage::logCodeOffset] = static_cast<std::uint8_t>(logCode);
  bytes[LogMessage::logCodeOffset + 1] = static_cast<std::uint8_t>(logCode >> 8);
  return bytes;
}

// Messages of the telephony server are left out: their payload is a property list.
void addShortest(const ClassIndex& index, const std::string& name, std::string_view technology,
                 std::vector<PacketCase>& cases) {
  for (const std::uint32_t code : index.logCodes()) {
    if (code >= LogMessage::extraCodeBase) continue;
    char text[16];
    std::snprintf(text, sizeof text, " 0x%04X", static_cast<unsigned>(code));
    if (std::ranges::find(cases, name + text, &PacketCase::name) != cases.end()) continue;
    const std::size_t size = index.subscription(code)->shortestTaken;
    cases.push_back({name + text, technology, [code, size] { return zeros(code, size); }});
  }
}

// The version of a packet's layout; 0 for codes whose packets have none.
std::uint32_t versionOf(const LogMessage& message) {
  const Packet payload = message.packet().from(Packet::headerSize);
  if (message.logCode() >= 0xB800 && message.logCode() <= 0xBFFF) return payload.u32(0);
  return message.logCode() >= 0xB000 && message.logCode() < 0xB800 ? payload.u8(0) : 0;
}

// The first packet of each log code and version that the simulated modem of all radios sends.
void addAllRadios(std::vector<PacketCase>& cases) {
  constexpr int messagesOfAWalk = 20'000;
  const auto modem = simulatedModem(technology::allRadios, 1);
  for (int i = 0; i < messagesOfAWalk; ++i) {
    const Bytes bytes = modem->next().bytes;
    const auto message = LogMessage::framed(bytes);
    if (!message || message->logCode() >= LogMessage::extraCodeBase) continue;
    char name[48];
    std::snprintf(name, sizeof name, "All radios 0x%04X v%s", static_cast<unsigned>(message->logCode()),
                  PacketVersion{versionOf(*message)}.text().c_str());
    if (std::ranges::find(cases, name, &PacketCase::name) != cases.end()) continue;
    cases.push_back({name, technology::allRadios, [bytes] { return bytes; }});
  }
}

std::vector<PacketCase> allCases() {
  std::vector<PacketCase> cases = fullPackets();
  std::ostream nowhere(nullptr);
  addShortest(LTEClassIndex(nowhere), "LTE", technology::kalviLTE, cases);
  addShortest(UTRANClassIndex(nowhere), "UTRAN", technology::kalviUTRAN2, cases);
  addShortest(KLV_GSMClassIndex(nowhere), "GSM/UMTS", technology::kalviGSMUMTS, cases);
  addAllRadios(cases);
  return cases;
}

}  // namespace

std::span<const PacketCase> packetCases() {
  static const std::vector<PacketCase> cases = allCases();
  return cases;
}

}  // namespace varnel
