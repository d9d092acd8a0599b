#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace varnel {

/// What a modem's diagnostic port is asked and what it answers. All of it is the contents of frames
/// (`host/captures/FrameEncoding.h`). An answer begins with the byte of its request, unless it is an error.
namespace portCommand {

inline constexpr std::uint8_t version = 0x00;
inline constexpr std::uint8_t events = 0x60;
inline constexpr std::uint8_t logConfiguration = 0x73;
inline constexpr std::uint8_t build = 0x7C;
inline constexpr std::uint8_t debugText = 0x7D;

/// First byte of an answer that refuses a request.
inline constexpr std::uint8_t firstError = 0x13, lastError = 0x18;

}  // namespace portCommand

/// The layout of requests and answers that begin with `portCommand::logConfiguration`. Numbers have four
/// bytes.
namespace logConfiguration {

inline constexpr std::size_t operationOffset = 4;
inline constexpr std::uint32_t allOff = 0, numbers = 1, setCodes = 3;

/// In a request to set codes. The mask has a bit per code, the lowest bit of the first byte for the code 0.
inline constexpr std::size_t equipmentOffset = 8, countOffset = 12, maskOffset = 16;

/// In every answer. 0 is success.
inline constexpr std::size_t statusOffset = 8;
/// In the answer to a request for the numbers: one number per equipment.
inline constexpr std::size_t numbersOffset = 12;
/// In the answer to a request to set codes.
inline constexpr std::size_t setEquipmentOffset = 12;

}  // namespace logConfiguration

/// A log code has 16 bits. The upper four are its equipment; the codes of an equipment have the lower twelve.
inline constexpr std::size_t equipments = 16;
inline constexpr std::uint32_t codesOfEquipment = 1 << 12;

/// How many log codes the modem has of each equipment, from the lowest code on; at most `codesOfEquipment`.
using CodeNumbers = std::array<std::uint32_t, equipments>;

/// The log codes of one equipment that are switched on.
struct CodeMask {
  std::uint32_t count = 0;  ///< how many codes the mask is about, from the lowest one on
  Bytes bits{};             ///< (count + 7) / 8 bytes

  bool operator==(const CodeMask&) const = default;
};

/// All requests that are ever sent to a port.
namespace portRequest {

Bytes version();
Bytes build();
Bytes eventsOff();
Bytes debugTextOff();
Bytes allCodesOff();
Bytes codeNumbers();
/// Replaces the whole mask of an equipment.
Bytes setCodes(std::size_t equipment, const CodeMask& mask);

}  // namespace portRequest

/// Whether the contents of a frame answer the request, with success or not. An error is followed by
/// the request that it answers, or by its beginning; one that is followed by nothing answers every request.
/// What merely repeats a request for the version is no answer.
bool isAnswer(ByteView contents, ByteView request);

/// Why the answer refuses the request, such as "error 0x13" or "status 2"; nothing when it does not.
std::optional<std::string> refusal(ByteView answer);

/// The numbers in an answer to `portRequest::codeNumbers`; nothing when it is too short.
std::optional<CodeNumbers> codeNumbersIn(ByteView answer);

/// The modem's own name of its build, in an answer to `portRequest::build`; empty when it has none.
std::string buildIn(ByteView answer);

/// When the build was made, in an answer to `portRequest::version`; empty when the answer is too short.
std::string compilationIn(ByteView answer);

}  // namespace varnel
