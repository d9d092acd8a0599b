#include <gtest/gtest.h>

#include <chrono>
#include <future>
#include <vector>

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/KLV/GSMUMTS/ActiveSet.h"
#include "LogGenerator/KLV/GSMUMTS/BLER.h"
#include "LogGenerator/KLV/GSMUMTS/DetectedSet.h"
#include "LogGenerator/KLV/GSMUMTS/EquivalentPLMNList.h"
#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"
#include "LogGenerator/KLV/GSMUMTS/MobileAllocation.h"
#include "LogGenerator/KLV/GSMUMTS/MonitoredSet.h"
#include "LogGenerator/KLV/GSMUMTS/NeighboringCells.h"
#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"
#include "LogGenerator/KLV/LTE/DetectedCells.h"
#include "LogGenerator/KLV/LTE/MeasuredNeighborCells.h"
#include "LogGenerator/KLV/LTE/NeighborCellsList.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/KLV/UTRAN/GSMNeighbhorMeasurements.h"
#include "LogGenerator/KLV/UTRAN/TRCHBLERMeasurement.h"
#include "LogGenerator/KLV/UTRAN/UTRANNeighbhorMeasurements.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/PacketBuilder.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

// Longer than any of the packets takes to decode.
constexpr auto aWhile = 200ms;

/// A decoder at work on a thread of its own.
struct Decoding {
  std::string sectionName;
  Value section;
  std::future<void> thread;

  bool hasEndedWithin(std::chrono::milliseconds time) const {
    return thread.wait_for(time) == std::future_status::ready;
  }
};

template <class Decoder>
Decoding decodingInto(const Value& section, const Bytes& message, std::uint32_t logCode) {
  const auto decode = [section, message, logCode] {
    CellMonitorReader cellMonitor;
    auto decoder = madeAlone<Decoder>(cellMonitor);
    decoder.updateSectionRef(section);
    decoder.updateWithData_logCode(Packet(message), logCode);
  };
  CellMonitorReader unused;
  return {std::string(madeAlone<Decoder>(unused).getSectionName()), section,
          std::async(std::launch::async, decode)};
}

// The shortest packet of the log code that is decoded, all zeros: its list is empty.
template <class Decoder>
Decoding emptyingAList(std::uint32_t logCode, std::size_t minimumSize) {
  return decodingInto<Decoder>(Value::ofArray({"old"}), PacketBuilder(logCode, minimumSize).bytes(), logCode);
}

template <class Decoder>
Decoding emptyingAListOfTheServer(std::uint32_t logCode) {
  return decodingInto<Decoder>(Value::ofArray({"old"}), serverMessage(logCode, Value::ofArray()), logCode);
}

TEST(ListSections, ChangeUnderTheArrayLockAlone) {
  std::vector<Decoding> decodings;
  ArrayLock::lockArray();
  decodings.push_back(emptyingAList<GSMSet>(0x4005, 15));
  decodings.push_back(emptyingAList<UMTSSet>(0x4005, 15));
  decodings.push_back(emptyingAListOfTheServer<UMTSSet>(0xFF0001));
  decodings.push_back(emptyingAList<ActiveSet>(0x417A, 16));
  decodings.push_back(emptyingAList<MonitoredSet>(0x417A, 16));
  decodings.push_back(emptyingAList<DetectedSet>(0x417A, 16));
  decodings.push_back(emptyingAList<EquivalentPLMNList>(0x7150, 17));
  decodings.push_back(emptyingAList<NeighboringCells>(0x5137, 29));
  decodings.push_back(emptyingAListOfTheServer<NeighboringCells>(0xFF0001));
  decodings.push_back(emptyingAList<MeasuredNeighborCells>(0xB179, 29));
  decodings.push_back(emptyingAList<DetectedCells>(0xB179, 29));
  decodings.push_back(emptyingAList<NeighborCellsList>(0xB180, 21));
  decodings.push_back(emptyingAList<ReselectionCandidatesList>(0xB186, 21));
  decodings.push_back(emptyingAList<UTRANNeighbhorMeasurements>(0xD00A, 21));
  decodings.push_back(emptyingAList<CCTRCHSIRMeasurement>(0xD00C, 17));
  decodings.push_back(emptyingAList<TRCHBLERMeasurement>(0xD00C, 17));
  decodings.push_back(emptyingAList<GSMNeighbhorMeasurements>(0xD00E, 17));
  decodings.push_back(emptyingAListOfTheServer<PDPContextList>(0xFF0002));
  decodings.front().hasEndedWithin(aWhile);
  for (const Decoding& decoding : decodings) {
    EXPECT_FALSE(decoding.hasEndedWithin(0ms)) << decoding.sectionName;
    EXPECT_EQ(described(decoding.section), R"(["old"])") << decoding.sectionName;
  }
  ArrayLock::unlockArray();
  for (Decoding& decoding : decodings) {
    decoding.thread.get();
    EXPECT_EQ(described(decoding.section), "[]") << decoding.sectionName;
  }
}

TEST(ListSections, AListThatAnEntryHoldsIsMadeAnewWithoutTheLock) {
  std::vector<Decoding> decodings;
  ArrayLock::lockArray();
  decodings.push_back(decodingInto<BLER>(Value::ofDictionary(), PacketBuilder(0x4116, 16).bytes(), 0x4116));
  decodings.push_back(
      decodingInto<MobileAllocation>(Value::ofDictionary(), PacketBuilder(0x51F8, 15).bytes(), 0x51F8));
  for (const Decoding& decoding : decodings) {
    EXPECT_TRUE(decoding.hasEndedWithin(1min)) << decoding.sectionName;
  }
  ArrayLock::unlockArray();
  for (Decoding& decoding : decodings) decoding.thread.get();
  EXPECT_EQ(described(decodings[0].section.dictionary()->get("Transport Channels")), "[]");
  EXPECT_EQ(described(decodings[1].section.dictionary()->get("ARFCNs")), "[]");
}

}  // namespace
}  // namespace varnel
