#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <functional>
#include <limits>
#include <ostream>
#include <random>
#include <string>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "base/Dictionary.h"
#include "base/MessagePrefix.h"
#include "host/FileResources.h"
#include "host/captures/Capture.h"
#include "host/captures/FramedCapture.h"
#include "host/captures/ModemTime.h"
#include "host/captures/PcapEncoders.h"
#include "host/captures/StreamEncoders.h"
#include "platform/TelephonyService.h"
#include "programs/shared/OfflineDecoder.h"
#include "programs/varnel-decode/database/CaptureDatabase.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"

// How long it takes to read captures, one line per way: the least that framing can take, framing alone, and
// reading and decoding whole captures, framed and as pcap. All are compared with a copy of the same bytes. In
// captures of real modems one record in 29 has a log code that the decoders of LTE know. The first capture
// here is like them; in the second one, every record has such a log code. The third one has the packets of
// all radios in the shares that they have there.
//
// Then, how long it takes to put values into a database: to gather those that change, and to write them.

namespace varnel {
namespace {

constexpr std::size_t records = 470'870;
constexpr int turns = 7;

struct Files {
  std::string framed, pcap;
};

void write(std::ofstream& file, ByteView bytes) {
  file.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
}

constexpr std::size_t differentMessages = 1000, longestMessage = 600;

// Packets of a simulated modem without the prefix, those that are wanted.
std::vector<Bytes> simulatedMessages(std::string_view technology,
                                     const std::function<bool(std::uint16_t logCode)>& isWanted) {
  const auto modem = simulatedModem(technology, 1);
  std::vector<Bytes> messages;
  while (messages.size() < differentMessages) {
    Bytes message = modem->next().bytes;
    if (message.front() == prefixMark) message.erase(message.begin(), message.begin() + prefixSize);
    const auto logCode = static_cast<std::uint16_t>(message[3] | message[4] << 8);
    if (message.front() == 1 && message.size() <= longestMessage && isWanted(logCode))
      messages.push_back(std::move(message));
  }
  return messages;
}

// Random packets of up to 77 bytes, with a log code that no decoder knows.
std::vector<Bytes> unknownMessages() {
  constexpr std::size_t smallest = 25, sizes = 53;
  std::mt19937 random(1);
  std::vector<Bytes> messages(differentMessages);
  for (Bytes& message : messages) {
    message.resize(smallest + random() % sizes);
    for (std::uint8_t& byte : message) byte = static_cast<std::uint8_t>(random());
    message[0] = 1;
    message[3] = 0xC8;
    message[4] = 0xB0;
  }
  return messages;
}

// A modem writes its own time into its packets.
void setTime(Bytes& message, Time time) {
  constexpr std::size_t timeOffset = 5;
  const ModemTime now = modemTimeOf(time);
  std::memcpy(message.data() + timeOffset, &now.raw, sizeof now.raw);
}

// What a capture holds: its kinds of messages, and how many of a hundred records are of each.
struct Kind {
  std::vector<Bytes> messages;
  std::size_t share;
};
using Mix = std::vector<Kind>;

// A message per millisecond. The kinds are spread evenly.
void makeFiles(const Files& files, Mix mix) {
  std::ofstream framed(files.framed, std::ios::binary), pcap(files.pcap, std::ios::binary);
  FramedWriter frames;
  PcapWriter packets;
  write(pcap, packets.beginning());
  std::size_t shares = 0;
  for (const Kind& kind : mix) shares += kind.share;
  constexpr std::size_t stride = 61;  // has no divisor in common with the shares
  for (std::size_t i = 0; i < records; ++i) {
    const Time time{1'709'301'909 + static_cast<std::int64_t>(i / 1000),
                    static_cast<std::int32_t>(i % 1000 * 1'000'000)};
    std::size_t place = i * stride % shares;
    auto kind = mix.begin();
    while (place >= kind->share) place -= (kind++)->share;
    Bytes& message = kind->messages[i % kind->messages.size()];
    setTime(message, time);
    const CaptureRecord record{time, Dating::Known, message, {}};
    write(framed, frames.encode(record));
    write(pcap, packets.encode(record));
  }
}

Bytes contentsOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  Bytes bytes(std::filesystem::file_size(path));
  file.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  return bytes;
}

// A checksum with tables for eight bytes, as most programs compute it.
class EightByteChecksum {
 public:
  EightByteChecksum() {
    for (unsigned byte = 0; byte < 256; ++byte) {
      unsigned rest = byte;
      for (int bit = 0; bit < 8; ++bit) rest = rest & 1 ? rest >> 1 ^ 0x8408 : rest >> 1;
      _tables[0][byte] = static_cast<std::uint16_t>(rest);
    }
    for (std::size_t n = 1; n < _tables.size(); ++n)
      for (unsigned byte = 0; byte < 256; ++byte)
        _tables[n][byte] =
            static_cast<std::uint16_t>(_tables[n - 1][byte] >> 8 ^ _tables[0][_tables[n - 1][byte] & 0xFF]);
  }

  bool isRight(ByteView frame) const {
    std::uint32_t rest = 0xFFFF;
    std::size_t i = 0;
    for (; frame.size() - i >= 8; i += 8) {
      std::uint64_t eight;
      std::memcpy(&eight, frame.data() + i, sizeof eight);
      eight ^= rest;
      rest = _tables[7][eight & 0xFF] ^ _tables[6][eight >> 8 & 0xFF] ^ _tables[5][eight >> 16 & 0xFF] ^
             _tables[4][eight >> 24 & 0xFF] ^ _tables[3][eight >> 32 & 0xFF] ^
             _tables[2][eight >> 40 & 0xFF] ^ _tables[1][eight >> 48 & 0xFF] ^ _tables[0][eight >> 56];
    }
    for (; i < frame.size(); ++i) rest = rest >> 8 ^ _tables[0][(rest ^ frame[i]) & 0xFF];
    return rest == 0xF0B8;
  }

 private:
  std::array<std::array<std::uint16_t, 256>, 8> _tables{};
};

// Finds the frames, removes their escapes, checks them, and counts their log codes. No reader can do less.
std::size_t floorOf(ByteView bytes) {
  static const EightByteChecksum checksum;
  static std::array<std::uint32_t, 65536> counts;
  std::array<std::uint8_t, 1 << 17> room;
  std::size_t found = 0;
  const std::uint8_t* at = bytes.data();
  const std::uint8_t* const end = at + bytes.size();
  while (const void* stop = std::memchr(at, 0x7E, static_cast<std::size_t>(end - at))) {
    const auto size = static_cast<std::size_t>(static_cast<const std::uint8_t*>(stop) - at);
    std::memcpy(room.data(), at, size);
    const auto frame = unescaped(std::span(room).first(size));
    at += size + 1;
    if (frame.size() < 18 || !checksum.isRight(frame)) continue;
    ++counts[frame[6] | frame[7] << 8];
    ++found;
  }
  return found;
}

std::size_t frameAlone(const std::string& path) {
  LeftOut leftOut;
  ByteWindow bytes(openFile(path, AtEndOfFile::Stop));
  FrameScanner frames(bytes, leftOut);
  std::size_t found = 0;
  while (frames.next()) ++found;
  return found;
}

std::size_t readAll(const std::string& path) {
  const auto capture = openCapture(path);
  std::size_t found = 0;
  for (CaptureRecord record; capture->next(record);) ++found;
  return found;
}

// Decodes to displays, one per two seconds.
std::size_t decodeAll(const std::string& path, std::string_view technology) {
  const FileResources resources{resourceFolder()};
  CaptureClock clock;
  const ApplicationInfo application;
  std::ostream nowhere(nullptr);
  const auto generator =
      LogGenerator::generatorFromTechnology(technology, {resources, clock, application, nowhere});
  OfflineDecoder decoder(*generator, clock, RawBytes::NotKept);
  const auto capture = openCapture(path);
  std::size_t found = 0;
  for (CaptureRecord record; capture->next(record); ++found) decoder.deliver(record.time, record.message);
  return found;
}

// The processor's time, so that other work on the machine does not count.
double secondsUsed() {
  timespec used{};
  ::clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &used);
  return static_cast<double>(used.tv_sec) + static_cast<double>(used.tv_nsec) * 1e-9;
}

struct Way {
  const char* name;
  std::function<std::size_t()> run;
  double best = std::numeric_limits<double>::infinity();
};

// The ways run in turns, so that all are slowed down alike.
void race(std::vector<Way>& ways) {
  for (int turn = 0; turn < turns; ++turn) {
    for (Way& way : ways) {
      const double start = secondsUsed();
      if (way.run() == 0) std::fprintf(stderr, "%s: nothing was found\n", way.name);
      way.best = std::min(way.best, secondsUsed() - start);
    }
  }
}

void measure(const char* name, std::string_view technology, Mix mix) {
  const auto folder = std::filesystem::temp_directory_path();
  const std::string fileName = "varnel-speed-" + std::to_string(::getpid());
  const Files files{folder / (fileName + ".framed"), folder / (fileName + ".pcap")};
  makeFiles(files, std::move(mix));
  const Bytes framed = contentsOf(files.framed);
  Bytes copy(framed.size());
  std::vector<Way> ways{
      {"floor", [&] { return floorOf(framed); }},
      {"memcpy",
       [&] {
         std::memcpy(copy.data(), framed.data(), framed.size());
         return std::size_t{1} + copy[framed.size() / 2];
       }},
      {"framing alone", [&] { return frameAlone(files.framed); }},
      {"framed, read", [&] { return readAll(files.framed); }},
      {"framed, decoded", [&] { return decodeAll(files.framed, technology); }},
      {"pcap, read", [&] { return readAll(files.pcap); }},
      {"pcap, decoded", [&] { return decodeAll(files.pcap, technology); }},
  };
  race(ways);
  std::filesystem::remove(files.framed);
  std::filesystem::remove(files.pcap);
  const auto size = static_cast<double>(framed.size());
  std::printf("%zu records, %.1f MB framed, %s\n%-18s %8s %8s %9s\n", records, size / 1e6, name, "way", "ms",
              "MB/s", "x floor");
  for (const Way& way : ways)
    std::printf("%-18s %8.1f %8.0f %9.2f\n", way.name, way.best * 1e3, size / way.best / 1e6,
                way.best / ways.front().best);
}

// A display of 20 sections with 25 levels each. In every display each of them has another number.
Value displayOfLevels(int number) {
  Value display = Value::ofDictionary();
  for (int section = 0; section < 20; ++section) {
    Value entries = Value::ofDictionary();
    for (int entry = 0; entry < 25; ++entry) {
      char level[16];
      std::snprintf(level, sizeof level, "-%d.%02d dBm", 60 + (number + entry) % 50,
                    (number + section) % 100);
      entries.dictionary()->set("Level " + std::to_string(entry), level);
    }
    display.dictionary()->set("Section " + std::to_string(section), entries);
  }
  return display;
}

void measureDatabase() {
  constexpr int captures = 10, displays = 100;
  const auto path = std::filesystem::temp_directory_path() / ("varnel-speed-" + std::to_string(::getpid()));
  std::vector<Generation> generations;
  for (int i = 0; i < displays; ++i)
    generations.push_back({.time = {1'709'301'909 + 2 * i, 0}, .display = displayOfLevels(i)});
  double gathering = 0, writing = 0;
  std::size_t values = 0;
  for (int i = 0; i < captures; ++i) {
    const double start = secondsUsed();
    ValueChanges changes;
    for (const Generation& generation : generations) changes.take(generation);
    const double gathered = secondsUsed();
    CaptureDatabase(path).store({.path = std::to_string(i)}, nullptr, &changes);
    gathering += gathered - start;
    writing += secondsUsed() - gathered;
    values += changes.paths().size() * changes.displays().size();
  }
  for (const char* const ending : {"", "-journal"}) std::filesystem::remove(path.string() + ending);
  const auto perSecond = [&](double seconds) { return static_cast<double>(values) / seconds / 1e3; };
  std::printf("%zu changed values of %d captures into a database, in thousands per second\n", values,
              captures);
  std::printf("gathered %.0f, written %.0f, both %.0f\n", perSecond(gathering), perSecond(writing),
              perSecond(gathering + writing));
}

}  // namespace
}  // namespace varnel

int main() {
  using namespace varnel;
  const auto any = [](std::uint16_t) { return true; };
  const std::vector<Bytes> lte = simulatedMessages(technology::kalviLTE, any);
  measure("one in 29 of a log code that the decoders know", technology::kalviLTE,
          {{lte, 1}, {unknownMessages(), 28}});
  measure("each of a log code that the decoders know", technology::kalviLTE, {{lte, 1}});
  const auto ofCodes = [](const auto&... codes) {
    return simulatedMessages(technology::allRadios,
                             [=](std::uint16_t logCode) { return ((logCode == codes) || ...); });
  };
  // The shares are those of captures of real modems.
  measure("all radios: 56 of 100 RRC messages of LTE, 17 other packets, 27 unknown", technology::allRadios,
          {{ofCodes(0xB0C0), 56},
           {ofCodes(0xB0E2, 0xB0E3, 0xB0EC, 0xB0ED, 0xB0EE), 7},
           {ofCodes(0xB193, 0xB195, 0xB179), 4},
           {ofCodes(0xB0C1, 0xB0C2), 3},
           {ofCodes(0xB0E4, 0xB0E5), 2},
           {ofCodes(0xB821), 1},
           {unknownMessages(), 27}});
  measureDatabase();
  return 0;
}
