#pragma once

#include <cstdint>
#include <span>

#include "host/captures/CaptureRecord.h"

namespace varnel {

/// The first byte of a frame of a diagnostic port.
namespace frameCommand {
inline constexpr std::uint8_t log = 0x10;
inline constexpr std::uint8_t ofSubscription = 0x98;  ///< a wrapper around another frame
inline constexpr std::uint8_t encryptedLog = 0x9E;
}  // namespace frameCommand

/// A log record without anything around it: length (2), code (2), time (8), payload.
inline constexpr std::size_t smallestRecord = 12;
/// The bytes before the record in a frame: the command, a byte without meaning, and the record's length.
inline constexpr std::size_t logFrameHeader = 4;
/// The bytes before a frame in the wrapper that names its subscription.
inline constexpr std::size_t subscriptionHeader = 8;
/// No frame has longer contents, since lengths have 16 bits.
inline constexpr std::size_t longestContents = subscriptionHeader + logFrameHeader + 0xFFFF;

/// Takes the record from the contents of a sound frame. The message uses the same bytes. False when there is
/// no record; the frame is then counted.
bool takeLogFrame(std::span<std::uint8_t> contents, CaptureRecord& record, LeftOut& leftOut);

/// Makes a message of a whole record by writing the log type into the byte before it.
void takeLogRecord(std::span<std::uint8_t> record, std::uint8_t logType, CaptureRecord& result);

/// Whether the contents are those of a log frame with consistent lengths, alone or in the wrapper.
bool isLogFrame(ByteView contents);

}  // namespace varnel
