#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdint>

#include "fuzz/InputSteps.h"
#include "fuzz/Require.h"
#include "host/captures/FrameEncoding.h"
#include "programs/varnel-telephonyd/sources/DeviceReads.h"
#include "programs/varnel-telephonyd/sources/PortSession.h"
#include "tests/support/FakeQueue.h"

using namespace varnel;

namespace {

using namespace std::chrono_literals;

// What follows the bytes of a step, and what they are. Several of these may be set.
enum PortStep : std::uint8_t { WaitASecond = 1, WantOthers = 2, End = 4, AreContents = 8 };

// In the first byte of an input.
constexpr std::uint8_t isNoSerialLine = 1;

// The layout of a request that switches codes on, here a second time, so that a mistake shows.
bool isMask(ByteView request) {
  constexpr std::uint8_t beginning[] = {0x73, 0, 0, 0, 3, 0, 0, 0};
  if (request.size() < 16 || !std::equal(std::begin(beginning), std::end(beginning), request.begin()))
    return false;
  const std::size_t count = request[12] + request[13] * std::size_t{256};
  const bool isSmall = request[14] == 0 && request[15] == 0 && count > 0 && count <= 4096;
  return isSmall && request[8] < 16 && request.size() == 16 + (count + 7) / 8;
}

// Requests that may be sent to a modem; there are no others.
bool isAllowed(ByteView request) {
  const Bytes allowed[] = {{0x00},
                           {0x7C},
                           {0x60, 0},
                           {0x7D, 5, 0, 0, 0, 0, 0, 0},
                           {0x73, 0, 0, 0, 0, 0, 0, 0},
                           {0x73, 0, 0, 0, 1, 0, 0, 0}};
  return isMask(request) ||
         std::ranges::any_of(allowed, [&](const Bytes& one) { return std::ranges::equal(one, request); });
}

void checkMessage(ByteView message) {
  const std::size_t begin = message.size() > 2 && message[0] == 0x81 ? 2 : 0;
  require(message.size() >= begin + 13, "a message has a whole header");
  require(message[begin] == 1, "a message of a modem has the log type 1");
}

class PortRun {
 public:
  explicit PortRun(DeviceReads::Device device) {
    _reads.begin(device);
    _session.begin();
  }

  void take(const InputStep& step) {
    Bytes framed;
    if ((step.after & AreContents) != 0) appendFramed(framed, step.message);
    _reads.take(framed.empty() ? step.message : ByteView(framed),
                [this](ByteView stream) { _session.take(stream); });
    if ((step.after & WantOthers) != 0) want(step.message);
    if ((step.after & WaitASecond) != 0) _queue.advance(1s);
    if ((step.after & End) != 0) end();
  }

  void end() {
    if (_isEnding) return;
    _isEnding = true;
    _session.end([this] { ++_ends; });
    // Three requests, of which the middle one may be the last that is waited for.
    _queue.advance(4s);
    require(_ends == 1, "the end comes once, after 4 s at the latest");
  }

 private:
  // The codes in the last bytes, two bytes each.
  void want(ByteView bytes) {
    CodeFilter::Codes codes;
    for (std::size_t i = 0; i + 1 < std::min<std::size_t>(bytes.size(), 8); i += 2)
      codes.insert(bytes[bytes.size() - 1 - i] * 256 + bytes[bytes.size() - 2 - i]);
    WantedCodes wanted;
    wanted.add({.modemCodes = std::move(codes), .serverCodes = {}});
    if (!_isEnding) _session.setWanted(std::move(wanted));
  }
  void check(ByteView sent) {
    _requests.take(sent, [](std::span<std::uint8_t> request) {
      require(isAllowed(request), "no other command is sent");
    });
    require(_ofRequests.frames() == 0, "every request is a sound frame");
  }

  FakeQueue _queue;
  LeftOut _leftOut, _ofRequests;
  FrameStream _requests{_ofRequests};
  DeviceReads _reads{_leftOut};
  int _failures = 0, _ends = 0, _timesReady = 0;
  bool _isEnding = false;
  PortSession _session{
      {.queue = _queue,
       .send = [this](ByteView bytes) { check(bytes); },
       .record = [](const CaptureRecord& record) { checkMessage(record.message); },
       .ready = [this] { require(++_timesReady == 1, "a session becomes ready once"); },
       .failed = [this](const PortFailure&) { require(++_failures == 1, "a session fails once"); },
       .refused = [](std::size_t equipment,
                     const std::string&) { require(equipment < equipments, "equipments are 0 to 15"); },
       .leftOut = _leftOut}};
};

}  // namespace

// The input says what kind of device the port has, and what a port answers, step by step.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  using Device = DeviceReads::Device;
  PortRun run((data[0] & isNoSerialLine) != 0 ? Device::Other : Device::SerialLine);
  ByteView input(data + 1, size - 1);
  while (const auto step = takeStep(input)) run.take(*step);
  run.end();
  return 0;
}
