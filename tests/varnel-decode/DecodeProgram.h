#pragma once

#include <gmock/gmock.h>

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <string>
#include <string_view>
#include <vector>

#include "base/Dictionary.h"
#include "base/PropertyList.h"
#include "tests/support/Process.h"

namespace varnel {

inline std::string littleEndian(std::uint64_t number, int bytes) {
  std::string text;
  for (int i = 0; i < bytes; ++i) text += static_cast<char>(number >> (8 * i) & 0xFF);
  return text;
}

inline constexpr std::uint32_t user0 = 147;
inline constexpr std::uint32_t ethernet = 1;

// pcap with nanoseconds.
inline std::string pcapHeader(std::uint32_t linkType = user0) {
  return littleEndian(0xA1B23C4D, 4) + littleEndian(2, 2) + littleEndian(4, 2) + littleEndian(0, 8) +
         littleEndian(262144, 4) + littleEndian(linkType, 4);
}

inline std::string pcapRecord(std::uint32_t seconds, std::uint32_t nanoseconds, const std::string& message) {
  return littleEndian(seconds, 4) + littleEndian(nanoseconds, 4) + littleEndian(message.size(), 4) +
         littleEndian(message.size(), 4) + message;
}

inline std::string pcapngBlock(std::uint32_t type, std::string body) {
  body.resize((body.size() + 3) / 4 * 4);
  const std::string length = littleEndian(12 + body.size(), 4);
  return littleEndian(type, 4) + length + body + length;
}

inline std::string packet(std::uint8_t logType, std::uint16_t logCode, const std::string& payload) {
  return littleEndian(logType, 1) + littleEndian(13 + payload.size(), 2) + littleEndian(logCode, 2) +
         littleEndian(0, 8) + payload;
}

// 22 bytes, the number of antennas at offset 20.
inline std::string antennas(char count) { return packet(1, 0xB0C1, std::string(7, '\0') + count + '\0'); }

inline std::string list(const std::string& content) {
  return "<plist version=\"1.0\">" + content + "</plist>";
}
inline std::string simFiles(const std::string& content) { return packet(0xFF, 0, list(content)); }
inline std::string pdpContexts(const std::string& content) { return packet(0xFF, 2, list(content)); }

inline constexpr std::uint32_t afternoon = 1709301909;  // 2024-03-01 14:05:09 UTC

inline std::size_t linesOf(const std::string& text) {
  return static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
}

inline Value readList(std::string_view text) {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(text.data());
  const auto list = readPropertyList({bytes, text.size()}, fileLimits);
  return list ? *list : Value();
}

class DecodeProgram : public ::testing::Test {
 protected:
  struct Result {
    int status;
    std::string output;
    std::string error;
  };

  static Result finish(Process& process) {
    EXPECT_TRUE(process.waitForEnd());
    return {process.exitStatus(), process.output(), process.error()};
  }

  static Result run(std::vector<std::string> arguments) {
    Process process(VARNEL_DECODE_PROGRAM, std::move(arguments));
    return finish(process);
  }

  // Runs the program in a shell, which redirects the rest.
  static Result runInShell(const std::string& rest) {
    Process process("/bin/sh", {"-c", "exec " VARNEL_DECODE_PROGRAM " --technology kalvi-lte " + rest});
    return finish(process);
  }

  std::string write(const std::string& name, const std::string& contents) const {
    const std::string path = folder.file(name);
    std::ofstream(path, std::ios::binary) << contents;
    return path;
  }

  Result decode(const std::string& capture, std::vector<std::string> options = {}) const {
    options.insert(options.begin(), {"--technology", "kalvi-lte"});
    options.push_back(write("capture", capture));
    return run(options);
  }

  TemporaryFolder folder;
};

}  // namespace varnel
