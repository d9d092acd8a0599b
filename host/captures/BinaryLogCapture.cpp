#include "host/captures/BinaryLogCapture.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "host/Subscription.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"
#include "host/captures/ModemTime.h"

namespace varnel {

namespace {

constexpr std::uint8_t packetLogType = 1, serverLogType = 0xFF;
constexpr std::uint16_t reportCode = 0x1FFD;
// The upper four bits of a modem's log code name a part of the modem and are never 0.
constexpr std::uint16_t firstModemCode = 0x1000;
constexpr std::size_t codeOffset = 2, timeOffset = 4;

// A server's count of milliseconds would take 49 days to get here, a modem's time 82 s from its start.
constexpr std::uint64_t leastModemTime = std::uint64_t{1} << 32;
// The year 2100.
constexpr std::uint64_t endOfTime = std::uint64_t{0x02C2} << 48;
// An hour in a modem's time, and more in a server's.
constexpr std::uint64_t near = std::uint64_t{3600} * 800 << 16;

constexpr int lookAhead = 3;  // records
constexpr std::size_t longestMessage = 3 + 0xFFFF;

bool isLogType(std::uint8_t byte) { return byte == packetLogType || byte == serverLogType; }

// A place where a record may begin, relative to the end of the last one.
struct Candidate {
  std::size_t recordOffset = 0;
  std::size_t end = 0;
  int likelihood = 0;  // 2 for a plausible time, 1 for a log type in its place
};

struct Candidates {
  std::array<Candidate, 3> list;
  std::size_t count = 0;
};

void add(Candidates& candidates, ByteView bytes, std::size_t recordOffset, int likelihood) {
  if (bytes.size() < recordOffset + smallestRecord) return;
  const ByteView record = bytes.subspan(recordOffset);
  const auto length = loadLittleEndian<std::uint16_t>(record, 0);
  if (length < smallestRecord || length > record.size()) return;
  const bool hasTime = loadLittleEndian<std::uint64_t>(record, timeOffset) < endOfTime;
  candidates.list[candidates.count++] = {recordOffset, recordOffset + length, likelihood + (hasTime ? 2 : 0)};
}

// A message begins with its log type, or with a prefix and its log type. The first message of an interval has
// lost its first byte.
Candidates candidatesAt(ByteView bytes) {
  Candidates candidates;
  if (bytes.size() < smallestRecord) return candidates;
  if (bytes[0] == prefixMark && isLogType(bytes[2])) add(candidates, bytes, 3, 1);
  if (isLogType(bytes[0])) add(candidates, bytes, 1, 1);
  if (isLogType(bytes[1])) add(candidates, bytes, 2, 0);
  if (candidates.count < candidates.list.size()) add(candidates, bytes, 0, 0);
  return candidates;
}

// How well the following records fit. The end of the log fits best.
int likelihoodOf(ByteView bytes, int records) {
  if (records == 0) return 0;
  if (bytes.empty()) return 3 * records;
  const Candidates candidates = candidatesAt(bytes);
  int best = 0;
  for (std::size_t i = 0; i < candidates.count; ++i) {
    const Candidate& candidate = candidates.list[i];
    best = std::max(best, candidate.likelihood + likelihoodOf(bytes.subspan(candidate.end), records - 1));
  }
  return best;
}

bool isNear(std::uint64_t time, std::optional<std::uint64_t> last) {
  return last && (time > *last ? time - *last : *last - time) < near;
}

}  // namespace

bool beginsWithVersionReport(ByteView bytes) {
  constexpr std::string_view name = "EXECUTABLE_NAME";
  constexpr std::size_t nameOffset = 23;
  return bytes.size() >= nameOffset + name.size() &&
         loadLittleEndian<std::uint16_t>(bytes, 0) == versionReportSize &&
         loadLittleEndian<std::uint16_t>(bytes, codeOffset) == reportCode &&
         std::equal(name.begin(), name.end(), bytes.begin() + nameOffset);
}

bool BinaryLogCapture::next(CaptureRecord& record) {
  if (_hasReport) passOverReport();
  for (;;) {
    bytes().holds((lookAhead + 1) * longestMessage);
    const ByteView unread = bytes().unread();
    if (unread.empty()) return false;
    std::optional<Candidate> best;
    int bestSum = -1;
    const Candidates candidates = candidatesAt(unread);
    for (std::size_t i = 0; i < candidates.count; ++i) {
      const Candidate& candidate = candidates.list[i];
      // After bytes that are no record, a byte before a log type is more likely one of them than a part of a
      // prefix.
      if (_position == Position::Searching && candidate.recordOffset == 2) continue;
      const int rest = likelihoodOf(unread.subspan(candidate.end), lookAhead);
      const bool hasTime = candidate.likelihood >= 2;
      const auto time = loadLittleEndian<std::uint64_t>(unread, candidate.recordOffset + timeOffset);
      const bool isLikely = _position == Position::BehindRecord
                                ? hasTime || rest >= 3
                                : (hasTime && rest >= 2) || isNear(time, _lastTime);
      if (!isLikely || candidate.likelihood + rest <= bestSum) continue;
      best = candidate;
      bestSum = candidate.likelihood + rest;
    }
    if (best) {
      take(best->recordOffset, best->end, record);
      return true;
    }
    if (_position == Position::BehindRecord) ++count().broken;
    _position = Position::Searching;
    ++count().noiseBytes;
    bytes().drop(1);
  }
}

void BinaryLogCapture::passOverReport() {
  _hasReport = false;
  if (bytes().holds(versionReportSize)) {
    bytes().drop(versionReportSize);
  } else {
    ++count().torn;
    bytes().drop(bytes().unread().size());
  }
}

void BinaryLogCapture::take(std::size_t recordOffset, std::size_t end, CaptureRecord& record) {
  const auto unread = bytes().unread();
  const auto bare = unread.subspan(recordOffset, end - recordOffset);
  const auto time = loadLittleEndian<std::uint64_t>(bare, timeOffset);
  const auto code = loadLittleEndian<std::uint16_t>(bare, codeOffset);
  const std::uint8_t lostLogType = code < firstModemCode ? serverLogType : packetLogType;
  takeLogRecord(bare, recordOffset == 0 ? lostLogType : unread[recordOffset - 1], record);
  if (recordOffset >= 2) {
    std::uint8_t* const first = bare.data() - 3;
    first[0] = prefixMark;
    record.message = {first, bare.size() + 3};
    record.subscription = subscriptionOf(record.message);
  }
  if (time < leastModemTime)
    record.time = {modemEpoch.seconds + static_cast<std::int64_t>(time / 1000),
                   static_cast<std::int32_t>(time % 1000 * 1'000'000)};
  _lastTime = time;
  _position = Position::BehindRecord;
  bytes().drop(end);
}

}  // namespace varnel
