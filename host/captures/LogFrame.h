#pragma once

#include <cstdint>
#include <span>

#include "host/captures/CaptureRecord.h"

namespace varnel {

/// What a frame of a diagnostic port begins with.
namespace frameCommand {
inline constexpr std::uint8_t log = 0x10;
inline constexpr std::uint8_t ofSubscription = 0x98;  ///< a wrapper around another frame
inline constexpr std::uint8_t encryptedLog = 0x9E;
}  // namespace frameCommand

/// A log record without anything around it: length (2), code (2), time (8), payload.
inline constexpr std::size_t smallestRecord = 12;
/// What stands before the record in a frame: the command, how many more there are, the record's length.
inline constexpr std::size_t logFrameHeader = 4;
/// What stands before a frame in the wrapper that names its subscription.
inline constexpr std::size_t subscriptionHeader = 8;
/// No frame's contents are longer: lengths have 16 bits.
inline constexpr std::size_t longestContents = subscriptionHeader + logFrameHeader + 0xFFFF;

/// The record in the contents of a sound frame, whose bytes it takes for the message. False when there is
/// none, which is then counted.
bool takeLogFrame(std::span<std::uint8_t> contents, CaptureRecord& record, LeftOut& leftOut);

/// Makes a message of a whole record, the log type before it. The byte before the record is written to.
void takeLogRecord(std::span<std::uint8_t> record, std::uint8_t logType, CaptureRecord& result);

/// Whether the contents of a frame are those of a log frame, alone or in the wrapper, with lengths that
/// agree.
bool isLogFrame(ByteView contents);

}  // namespace varnel
