// make-captures FILE TECHNOLOGY SECONDS: writes a capture of one simulated modem, of that length.
//
// make-captures FOLDER COUNT SECONDS: writes captures of simulated modems into a tree of folders. They differ
// in technology and length: the shortest has that many seconds, the longest nine times as many. Every 40th is
// cut off, and the decoder of every 50th aborts. The same arguments make the same bytes.

#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>

#include "host/captures/PcapEncoders.h"
#include "programs/varnel-telephonyd/simulation/Technologies.h"

namespace varnel {
namespace {

constexpr std::int64_t start_s = 1'709'301'909;  // 2024-03-01 14:05:09 UTC

// SIM files that are no property list.
const Bytes badMessage = {0xFF, 14, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, '?'};

void append(std::string& file, ByteView bytes) {
  file.append(reinterpret_cast<const char*>(bytes.data()), bytes.size());
}

// The messages of a modem as a file, piece by piece.
template <class Take>
void encode(PcapngWriter& writer, std::string_view technology, std::uint64_t seed,
            std::chrono::seconds duration, const Take& take) {
  take(writer.beginning());
  CaptureRecord record;
  const auto modem = simulatedModem(technology, seed);
  for (SimulatedMessage next = modem->next(); next.at <= duration; next = modem->next()) {
    const std::int64_t milliseconds = next.at.count();
    record.time = {start_s + static_cast<std::int64_t>(seed) * 60 + milliseconds / 1000,
                   static_cast<std::int32_t>(milliseconds % 1000 * 1'000'000)};
    record.message = next.bytes;
    take(writer.encode(record));
  }
}

std::string captureOf(std::string_view technology, std::uint64_t seed, std::chrono::seconds duration) {
  PcapngWriter writer{std::string(technology)};
  std::string file;
  encode(writer, technology, seed, duration, [&](ByteView bytes) { append(file, bytes); });
  CaptureRecord record;
  if (seed % 50 == 49) {
    record.time = {start_s + static_cast<std::int64_t>(seed) * 60 + duration.count(), 0};
    record.message = badMessage;
    append(file, writer.encode(record));
  }
  if (seed % 40 == 39) file.resize(file.size() - 7);
  return file;
}

void makeCaptures(const std::filesystem::path& folder, std::uint64_t count, std::int64_t seconds) {
  const auto technologies = simulatedTechnologies();
  for (std::uint64_t i = 0; i < count; ++i) {
    const auto place = folder / ("day " + std::to_string(i / 20)) / (std::to_string(i) + ".pcapng");
    std::filesystem::create_directories(place.parent_path());
    const std::chrono::seconds duration(seconds * (1 + static_cast<std::int64_t>(i * 5 % 9)));
    const auto technology =
        i % 50 == 49 ? std::string_view("kalvi-lte") : technologies[i % technologies.size()];
    std::ofstream(place, std::ios::binary) << captureOf(technology, i, duration);
  }
}

// A long capture does not fit in memory.
void makeCapture(const std::string& path, std::string_view technology, std::int64_t seconds) {
  std::ofstream file(path, std::ios::binary);
  PcapngWriter writer{std::string(technology)};
  encode(writer, technology, 7, std::chrono::seconds(seconds), [&](ByteView bytes) {
    file.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  });
}

}  // namespace
}  // namespace varnel

int main(int argumentCount, char** arguments) {
  if (argumentCount != 4) {
    std::cerr << "usage: make-captures FOLDER COUNT SECONDS, or make-captures FILE TECHNOLOGY SECONDS\n";
    return 2;
  }
  if (!std::isdigit(static_cast<unsigned char>(*arguments[2]))) {
    varnel::makeCapture(arguments[1], arguments[2], std::strtoll(arguments[3], nullptr, 10));
    return 0;
  }
  varnel::makeCaptures(arguments[1], std::strtoull(arguments[2], nullptr, 10),
                       std::strtoll(arguments[3], nullptr, 10));
  return 0;
}
