#include "programs/varnel-telephonyd/sources/DeviceReads.h"

#include <algorithm>
#include <utility>

#include "host/captures/LittleEndian.h"

namespace varnel {

namespace {

constexpr std::size_t numberSize = 4;
constexpr std::size_t countOffset = 4, lengthOffset = 8, firstContents = 12;
constexpr std::uint32_t kindOfStream = 32;
// Larger numbers belong to no message.
constexpr std::uint32_t mostBuffers = 1 << 12, longestBuffer = 1 << 20;

bool mayBe(std::uint32_t number, std::uint32_t most) { return number > 0 && number <= most; }

// Whether the stream's first bytes may be the beginning of a message, as far as they have come.
bool mayBeMessage(ByteView bytes) {
  constexpr std::uint8_t kind[numberSize] = {kindOfStream, 0, 0, 0};
  const std::size_t known = std::min(bytes.size(), numberSize);
  if (!std::equal(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(known), kind)) return false;
  if (bytes.size() < lengthOffset) return true;
  if (!mayBe(loadLittleEndian<std::uint32_t>(bytes, countOffset), mostBuffers)) return false;
  return bytes.size() < firstContents ||
         mayBe(loadLittleEndian<std::uint32_t>(bytes, lengthOffset), longestBuffer);
}

}  // namespace

void DeviceReads::begin(Device device) {
  _form = device == Device::SerialLine ? Form::Stream : Form::Unknown;
  _first.clear();
  _part = Part::Kind;
  _number.clear();
}

void DeviceReads::take(ByteView read, const Take& takeStream) {
  if (_form == Form::Stream) return takeStream(read);
  if (_form == Form::Messages) return takeMessages(read, takeStream);
  _first.insert(_first.end(), read.begin(), read.end());
  const bool isMessage = mayBeMessage(_first);
  if (isMessage && _first.size() < firstContents) return;
  _form = isMessage ? Form::Messages : Form::Stream;
  const Bytes first = std::exchange(_first, {});
  take(first, takeStream);
}

void DeviceReads::takeMessages(ByteView bytes, const Take& takeStream) {
  while (!bytes.empty()) {
    const std::size_t missing = _part == Part::Contents ? _bytes : numberSize - _number.size();
    const ByteView here = bytes.first(std::min(missing, bytes.size()));
    bytes = bytes.subspan(here.size());
    if (_part == Part::Contents) {
      _bytes -= static_cast<std::uint32_t>(here.size());
      if (_bytes == 0) endBuffer();
      takeStream(here);
      continue;
    }
    _number.insert(_number.end(), here.begin(), here.end());
    if (_number.size() < numberSize) return;
    const auto number = loadLittleEndian<std::uint32_t>(_number, 0);
    _number.clear();
    if (takeNumber(number)) continue;
    // A read begins with a message, unless the one before goes on.
    _part = Part::Kind;
    _counts.noiseBytes += numberSize + bytes.size();
    return;
  }
}

// False when the number cannot be right.
bool DeviceReads::takeNumber(std::uint32_t number) {
  switch (_part) {
    case Part::Kind:
      _part = Part::Count;
      return number == kindOfStream;
    case Part::Count:
      _buffers = number;
      _part = number > 0 ? Part::Length : Part::Kind;
      return number <= mostBuffers;
    case Part::Length:
      _bytes = number;
      _part = Part::Contents;
      if (number == 0) endBuffer();
      return number <= longestBuffer;
    case Part::Contents:
      break;
  }
  return false;
}

void DeviceReads::endBuffer() {
  --_buffers;
  _part = _buffers > 0 ? Part::Length : Part::Kind;
}

}  // namespace varnel
