#include "host/captures/CaptureKind.h"

#include <algorithm>
#include <string_view>

#include "host/captures/BinaryLogCapture.h"
#include "host/captures/FrameChecksum.h"
#include "host/captures/FramedCapture.h"
#include "host/captures/LengthFramedCapture.h"
#include "host/captures/LittleEndian.h"
#include "host/captures/LogFrame.h"
#include "host/captures/PcapCapture.h"
#include "host/captures/PcapngCapture.h"

namespace varnel {

namespace {

using Verdict = Recognition::Verdict;
using namespace std::string_view_literals;

constexpr std::uint8_t frameEnd = 0x7E;

bool beginsWith(ByteView bytes, std::string_view magic) {
  return bytes.size() >= magic.size() &&
         std::equal(magic.begin(), magic.end(), bytes.begin(), [](char wanted, std::uint8_t found) {
           return static_cast<std::uint8_t>(wanted) == found;
         });
}

struct Magic {
  std::string_view bytes;
  const char* what;
};

constexpr Magic foreignMagics[] = {
    {"\x89PNG"sv, "holds a picture, no capture"},
    {"\xFF\xD8\xFF"sv, "holds a picture, no capture"},
    {"GIF8"sv, "holds a picture, no capture"},
    {"%PDF"sv, "holds a document, no capture"},
    {"PK\x03\x04"sv, "is an archive, no capture; unpack it first, with unzip"},
    {"7z\xBC\xAF"sv, "is an archive, no capture; unpack it first, with 7z"},
    {"\xFD"
     "7zXZ"sv,
     "is packed; unpack it first, with xz -d"},
    {"BZh"sv, "is packed; unpack it first, with bzip2 -d"},
    {"\x28\xB5\x2F\xFD"sv, "is packed; unpack it first, with zstd -d"},
    {"\x7F"
     "ELF"sv,
     "is a program, no capture"},
    {"SQLite format 3"sv, "is a database, no capture"},
};

const Magic* foreignMagicOf(ByteView bytes) {
  const auto* const found =
      std::ranges::find_if(foreignMagics, [&](const Magic& magic) { return beginsWith(bytes, magic.bytes); });
  return found == std::end(foreignMagics) ? nullptr : found;
}

bool isText(ByteView bytes) {
  constexpr std::size_t enough = 4096;
  bytes = bytes.first(std::min(bytes.size(), enough));
  return std::ranges::all_of(bytes, [](std::uint8_t byte) {
    return (byte >= 0x20 && byte != 0x7F) || (byte >= '\t' && byte <= '\r') || byte == 0x1B;
  });
}

Verdict verdictWithoutMore(Beginning beginning, Verdict otherwise) {
  return beginning == Beginning::Whole ? otherwise : Verdict::NeedsMore;
}

// Whether frames with lengths begin here. One log frame is enough; any other frame needs a second one after
// it.
Verdict lengthFrames(ByteView bytes, Beginning beginning) {
  const auto size = lengthFrameAt(bytes);
  if (!size) return verdictWithoutMore(beginning, Verdict::Unknown);
  if (*size == 0) return Verdict::Unknown;
  if (isLogFrame(bytes.subspan(lengthFrameHeader, *size - lengthFrameHeader - lengthFrameTrailer)))
    return Verdict::Known;
  const ByteView rest = bytes.subspan(*size);
  if (rest.size() < 2) return verdictWithoutMore(beginning, rest.empty() ? Verdict::Known : Verdict::Unknown);
  return rest[0] == frameEnd && rest[1] == 0x01 ? Verdict::Known : Verdict::Unknown;
}

// Whether the bytes hold a log frame with a length.
bool hasLengthFrame(ByteView bytes) {
  bytes = bytes.first(std::min(bytes.size(), longestSearch));
  for (auto at = bytes.begin(); at != bytes.end(); ++at) {
    const ByteView rest(at, bytes.end());
    const std::size_t size = rest[0] == frameEnd ? lengthFrameAt(rest).value_or(0) : 0;
    if (size > 0 &&
        isLogFrame(rest.subspan(lengthFrameHeader, size - lengthFrameHeader - lengthFrameTrailer)))
      return true;
  }
  return false;
}

bool isSoundSegment(ByteView segment) {
  constexpr std::size_t smallest = 3;
  if (segment.size() < smallest) return false;
  Bytes copy(segment.begin(), segment.end());
  const auto frame = unescaped(copy);
  return frame.size() >= smallest && isSound(frame);
}

// Whether the bytes begin with a whole, sound frame. Before it, there may be the end of another frame.
bool beginsWithSoundFrame(ByteView bytes) {
  while (!bytes.empty() && bytes[0] == frameEnd) bytes = bytes.subspan(1);
  const auto end = std::ranges::find(bytes, frameEnd);
  return end != bytes.end() && isSoundSegment({bytes.begin(), end});
}

// Whether the bytes hold a sound frame with a checksum.
bool hasSoundFrame(ByteView bytes) {
  bytes = bytes.first(std::min(bytes.size(), longestSearch));
  auto begin = bytes.begin();
  for (auto end = bytes.begin(); end != bytes.end(); ++end) {
    if (*end != frameEnd) continue;
    if (isSoundSegment({begin, end})) return true;
    begin = end + 1;
  }
  return false;
}

// Whether records follow each other from the first byte: three, or all that there are except a torn one.
Verdict recordChain(ByteView bytes, Beginning beginning) {
  constexpr int enough = 3;
  constexpr std::size_t codeOffset = 2, timeEnd = smallestRecord - sizeof(std::uint16_t);
  constexpr std::uint16_t endOfTime = 0x02C2;  // the year 2100, in the upper bits of a modem's time
  for (int records = 0; records < enough; ++records) {
    const Verdict verdictAtEnd =
        verdictWithoutMore(beginning, records > 0 ? Verdict::Known : Verdict::Unknown);
    if (bytes.size() < smallestRecord) return verdictAtEnd;
    const auto length = loadLittleEndian<std::uint16_t>(bytes, 0);
    const bool isPlausible = length >= smallestRecord &&
                             loadLittleEndian<std::uint16_t>(bytes, codeOffset) != 0 &&
                             loadLittleEndian<std::uint16_t>(bytes, timeEnd) < endOfTime;
    if (!isPlausible) return Verdict::Unknown;
    if (bytes.size() < length) return verdictAtEnd;
    bytes = bytes.subspan(length);
  }
  return Verdict::Known;
}

// The header of a phone's own log file: its length (4), version (1), whether frames have checksums (1), the
// number of identifiers (4), and the identifiers (16 each). Later versions have more.
Recognition logFileHeader(ByteView bytes, Beginning beginning) {
  constexpr std::uint32_t fixedSize = 10, identifierSize = 16, largest = 4096, lengthSize = 4;
  constexpr std::uint8_t latestVersion = 16;
  if (bytes.size() < fixedSize) return {verdictWithoutMore(beginning, Verdict::Unknown)};
  const auto length = loadLittleEndian<std::uint32_t>(bytes, 0);
  const std::uint8_t version = bytes[4], flag = bytes[5];
  const std::uint64_t identifiers = std::uint64_t{loadLittleEndian<std::uint32_t>(bytes, 6)} * identifierSize;
  if (length >= largest || version == 0 || version > latestVersion || flag > 1) return {};
  if (length + lengthSize < fixedSize + identifiers) return {};
  // Most lengths include their own bytes.
  for (const std::uint32_t size : {length, length + lengthSize}) {
    if (size < fixedSize + identifiers) continue;
    if (bytes.size() < size) return {verdictWithoutMore(beginning, Verdict::Unknown)};
    const ByteView frames = bytes.subspan(size);
    const bool mayBegin = frames.empty() || frames[0] == frameEnd || flag == 1;
    if (!mayBegin) continue;
    if (flag == 1 && hasSoundFrame(frames)) return {Verdict::Known, CaptureKind::FramedStream, size};
    const Verdict verdict = flag == 0                      ? lengthFrames(frames, beginning)
                            : bytes.size() < longestSearch ? verdictWithoutMore(beginning, Verdict::Unknown)
                                                           : Verdict::Unknown;
    if (verdict == Verdict::Known) return {verdict, CaptureKind::LengthFramedStream, size};
    if (verdict == Verdict::NeedsMore) return {verdict};
  }
  return {};
}

std::optional<CaptureKind> kindByMagic(ByteView bytes) {
  if (isPcapMagic(bytes)) return CaptureKind::Pcap;
  if (isPcapngMagic(bytes)) return CaptureKind::Pcapng;
  if (beginsWith(bytes, "\x1F\x8B"sv)) return CaptureKind::Gzip;
  if (beginsWithVersionReport(bytes)) return CaptureKind::BinaryLog;
  return std::nullopt;
}

}  // namespace

Recognition recognise(ByteView bytes, Beginning beginning) {
  if (const auto kind = kindByMagic(bytes)) return {Verdict::Known, *kind};
  if (foreignMagicOf(bytes)) return {};
  const Recognition header = logFileHeader(bytes, beginning);
  if (header.verdict == Verdict::Known) return header;

  const Verdict frames = lengthFrames(bytes, beginning);
  if (frames == Verdict::Known) return {frames, CaptureKind::LengthFramedStream};
  if (beginsWithSoundFrame(bytes)) return {Verdict::Known, CaptureKind::FramedStream};
  const Verdict chain = recordChain(bytes, beginning);
  if (chain == Verdict::Known) return {chain, CaptureKind::RecordStream};
  if (hasSoundFrame(bytes)) return {Verdict::Known, CaptureKind::FramedStream};
  if (hasLengthFrame(bytes)) return {Verdict::Known, CaptureKind::LengthFramedStream};

  const bool mayChange = header.verdict == Verdict::NeedsMore || frames == Verdict::NeedsMore ||
                         chain == Verdict::NeedsMore || bytes.size() < longestSearch;
  return {mayChange ? verdictWithoutMore(beginning, Verdict::Unknown) : Verdict::Unknown};
}

std::string whatElseItIs(ByteView bytes) {
  if (bytes.empty()) return "is empty, and so no capture";
  if (const Magic* foreign = foreignMagicOf(bytes)) return foreign->what;
  if (isText(bytes))
    return "holds text, no capture; a capture is what a modem's diagnostic port sends, byte for byte";
  return "is no capture that is known: neither pcap, nor frames of a diagnostic port, nor log records; was "
         "all of it copied, from its first byte on?";
}

}  // namespace varnel
