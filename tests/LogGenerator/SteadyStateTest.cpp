#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <set>

#include "LogGenerator/LogGenerator.h"
#include "host/FileResources.h"
#include "platform/TelephonyService.h"
#include "tests/support/AllocationCounter.h"
#include "tests/support/SimulatedMessages.h"
#include "tests/support/TestServices.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

using Codes = std::set<unsigned>;

/// A generator with its shipped template.
class Generator {
 public:
  explicit Generator(std::string_view technology)
      : _generator(LogGenerator::generatorFromTechnology(
            technology,
            {_resources, _host.services.clock, _host.services.application, _host.services.standardOutput})) {}

  /// How often one more interval of these messages allocates, when those before were the same.
  std::uint64_t allocationsForInterval(const std::vector<SimulatedPacket>& messages) {
    for (int interval = 0; interval < 3; ++interval) {
      take(messages);
      _generator->generateLogUsingState(_state);
    }
    return allocationsFor(messages);
  }

  /// How often the message allocates when it comes again within an interval.
  std::uint64_t allocationsForRepeated(const SimulatedPacket& message) {
    take({message, message});
    _generator->generateLogUsingState(_state);
    take({message});
    return allocationsFor({message});
  }

 private:
  std::uint64_t allocationsFor(const std::vector<SimulatedPacket>& messages) {
    const std::uint64_t before = allocationCount();
    take(messages);
    return allocationCount() - before;
  }

  void take(const std::vector<SimulatedPacket>& messages) {
    for (const SimulatedPacket& message : messages) _generator->updateState_withData(_state, message.packet);
  }

  TestServices _host;
  const FileResources _resources{resourceFolder()};
  Dictionary _state;
  std::unique_ptr<LogGenerator> _generator;
};

// The log codes of which a message allocates nothing, among all that the modem sends within ten minutes.
Codes codesWithoutAllocation(std::string_view technology) {
  std::map<unsigned, std::vector<SimulatedPacket>> messages;
  for (SimulatedPacket& message : simulatedMessages(technology, 7, 10min))
    messages[message.code()].push_back(std::move(message));
  Codes codes;
  Generator generator(technology);
  for (const auto& [code, itsMessages] : messages) {
    if (generator.allocationsForInterval(itsMessages) == 0) codes.insert(code);
  }
  return codes;
}

// Property lists and lists of cells take memory for what they hold.
TEST(SteadyState, LTERowsAllocateNothing) {
  EXPECT_EQ(codesWithoutAllocation(technology::kalviLTE), (Codes{0xB0C1, 0xB0C2, 0xB17F}));
}

TEST(SteadyState, UTRANRowsAllocateNothing) {
  EXPECT_EQ(codesWithoutAllocation(technology::kalviUTRAN2), (Codes{0xD0E0, 0xD0E2}));
}

TEST(SteadyState, GSMUMTSRowsAllocateNothing) {
  EXPECT_EQ(codesWithoutAllocation(technology::kalviGSMUMTS),
            (Codes{0x4031, 0x4125, 0x4127, 0x4157, 0x5072, 0x5076, 0x512C, 0x5134, 0x51F4, 0x51F5, 0x51F6,
                   0x51FB, 0x51FD, 0x7130, 0x7131, 0x7132, 0x7135}));
}

// An active set or a row of fingers takes memory while it grows, and where a display in the history has it.
TEST(SteadyState, CDMA2000RowsAllocateNothing) {
  EXPECT_EQ(codesWithoutAllocation(technology::kalviCDMA), (Codes{0x1183, 0x1192, 0x119D, 0x127E, 0x134F}));
}

// The list of the last messages is made for the display, not for each message.
TEST(SteadyState, AllRadiosRowsAndMessagesAllocateNothing) {
  EXPECT_EQ(codesWithoutAllocation(technology::allRadios),
            (Codes{0x134F, 0x4031, 0x4125, 0x4127, 0x412F, 0x4157, 0x5072, 0x5076, 0x512C, 0x512F, 0x5134,
                   0x51F4, 0x51F5, 0x51F6, 0x51FB, 0x51FD, 0x7130, 0x7131, 0x7132, 0x7135, 0x713A, 0xB061,
                   0xB062, 0xB0C0, 0xB0C1, 0xB0C2, 0xB0E2, 0xB0E3, 0xB0EA, 0xB0EB, 0xB0EC, 0xB0ED, 0xB0EE,
                   0xB139, 0xB166, 0xB167, 0xB168, 0xB16A, 0xB16E, 0xB16F, 0xB179, 0xB17F, 0xB180, 0xB195,
                   0xB800, 0xB801, 0xB80A, 0xB80B, 0xB80C, 0xB821, 0xB822, 0xB823}));
}

TEST(SteadyState, CDMA2000PilotsThatComeAgainAllocateNothing) {
  Generator generator(technology::kalviCDMA);
  Codes codes;
  for (const SimulatedPacket& message : simulatedMessages(technology::kalviCDMA, 7, 1min)) {
    codes.insert(message.code());
    ASSERT_EQ(generator.allocationsForRepeated(message), 0u) << std::hex << message.code();
  }
  EXPECT_THAT(codes, testing::IsSupersetOf({0x108Au, 0x119Cu, 0x12B6u}));
}

}  // namespace
}  // namespace varnel
