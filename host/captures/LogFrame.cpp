#include "host/captures/LogFrame.h"

#include <optional>

#include "base/MessagePrefix.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/ModemTime.h"

namespace varnel {

namespace {

constexpr std::size_t timeOffset = 4;
constexpr std::size_t subscriptionOffset = 4;
constexpr std::uint8_t packetLogType = 1;

// The log channel has one byte for the subscription, where 0 is none. Larger numbers stand for "any" and the
// like.
std::optional<std::uint8_t> subscriptionNumber(std::uint32_t number) {
  if (number == 0 || number > 0xFF) return std::nullopt;
  return static_cast<std::uint8_t>(number);
}

std::optional<std::uint8_t> unwrap(std::span<std::uint8_t>& contents) {
  if (contents.size() <= subscriptionHeader || contents[0] != frameCommand::ofSubscription)
    return std::nullopt;
  const auto subscription = subscriptionNumber(loadLittleEndian<std::uint32_t>(contents, subscriptionOffset));
  contents = contents.subspan(subscriptionHeader);
  return subscription;
}

// Of the two lengths, the record's own counts. Nothing when the record is longer than the frame.
std::span<std::uint8_t> recordIn(std::span<std::uint8_t> contents) {
  if (contents.size() < logFrameHeader + smallestRecord) return {};
  const auto length = loadLittleEndian<std::uint16_t>(contents, logFrameHeader);
  if (length < smallestRecord || length > contents.size() - logFrameHeader) return {};
  return contents.subspan(logFrameHeader, length);
}

}  // namespace

void takeLogRecord(std::span<std::uint8_t> record, std::uint8_t logType, CaptureRecord& result) {
  const ModemTime time{loadLittleEndian<std::uint64_t>(record, timeOffset)};
  std::uint8_t* const first = record.data() - 1;
  *first = logType;
  result.time = timeOf(time);
  result.dating = datingOf(time);
  result.message = {first, record.size() + 1};
  result.subscription.reset();
}

bool takeLogFrame(std::span<std::uint8_t> contents, CaptureRecord& record, LeftOut& leftOut) {
  const auto subscription = unwrap(contents);
  if (contents.empty() || contents[0] != frameCommand::log) {
    const bool isEncrypted = !contents.empty() && contents[0] == frameCommand::encryptedLog;
    ++(isEncrypted ? leftOut.encrypted : leftOut.otherCommands);
    return false;
  }
  const std::span<std::uint8_t> found = recordIn(contents);
  if (found.empty()) {
    ++leftOut.broken;
    return false;
  }
  takeLogRecord(found, packetLogType, record);
  if (subscription) {
    std::uint8_t* const first = found.data() - 3;
    first[0] = prefixMark;
    first[1] = *subscription;
    record.message = {first, found.size() + 3};
    record.subscription = subscription;
  }
  return true;
}

bool isLogFrame(ByteView contents) {
  if (contents.size() > subscriptionHeader && contents[0] == frameCommand::ofSubscription)
    contents = contents.subspan(subscriptionHeader);
  if (contents.size() < logFrameHeader + smallestRecord || contents[0] != frameCommand::log) return false;
  const std::size_t length = contents.size() - logFrameHeader;
  return loadLittleEndian<std::uint16_t>(contents, 2) == length &&
         loadLittleEndian<std::uint16_t>(contents, logFrameHeader) == length;
}

}  // namespace varnel
