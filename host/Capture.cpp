#include "host/Capture.h"

#include <pcap/pcap.h>
#include <sys/stat.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <limits>
#include <new>
#include <system_error>

#include "host/OutputStream.h"

namespace varnel {

namespace {

constexpr int logChannelLinkType = DLT_USER0;
constexpr std::int64_t nanosecondsPerSecond = 1'000'000'000;

// The library refuses pcap records of more than 256 KiB, and cuts those that are longer than the snapshot
// length in the file's header; but not where link type and snapshot length tell it to expect long ones. Log
// messages may be longer, so it is shown a header that says so.
constexpr int longRecordLinkType = DLT_DBUS;
constexpr int longRecordSnapshotLength = std::numeric_limits<int>::max();

std::string linkTypeText(int linkType) {
  const char* name = pcap_datalink_val_to_name(linkType);
  return std::to_string(linkType) + (name ? std::string(" (") + name + ")" : "");
}

// The header of a pcap file, in the byte order of whoever wrote it.
class FileHeader {
 public:
  explicit FileHeader(std::FILE* file) : _size(std::fread(_bytes.data(), 1, _bytes.size(), file)) {}

  ByteView bytes() const { return {_bytes.data(), _size}; }

  bool isOfLogChannel() const {
    return isPcap() && word(linkTypeOffset) == static_cast<std::uint32_t>(logChannelLinkType);
  }
  void announceLongRecords() {
    setWord(linkTypeOffset, longRecordLinkType);
    setWord(snapshotOffset, longRecordSnapshotLength);
  }

 private:
  static constexpr std::size_t snapshotOffset = 16, linkTypeOffset = 20;
  static constexpr std::uint32_t microsecondMagic = 0xA1B2C3D4, nanosecondMagic = 0xA1B23C4D;

  static bool isMagic(std::uint32_t word) { return word == microsecondMagic || word == nanosecondMagic; }
  bool isPcap() const {
    return _size == _bytes.size() && (isMagic(littleEndianWord(0)) || isMagic(bigEndianWord(0)));
  }
  std::uint32_t littleEndianWord(std::size_t offset) const {
    const auto* at = &_bytes[offset];
    return at[0] | std::uint32_t{at[1]} << 8 | std::uint32_t{at[2]} << 16 | std::uint32_t{at[3]} << 24;
  }
  std::uint32_t bigEndianWord(std::size_t offset) const {
    const auto* at = &_bytes[offset];
    return at[3] | std::uint32_t{at[2]} << 8 | std::uint32_t{at[1]} << 16 | std::uint32_t{at[0]} << 24;
  }
  std::uint32_t word(std::size_t offset) const {
    return isMagic(littleEndianWord(0)) ? littleEndianWord(offset) : bigEndianWord(offset);
  }
  void setWord(std::size_t offset, std::uint32_t number) {
    const bool isLittleEndian = isMagic(littleEndianWord(0));
    for (std::size_t i = 0; i < 4; ++i)
      _bytes[offset + (isLittleEndian ? i : 3 - i)] = static_cast<std::uint8_t>(number >> 8 * i);
  }

  std::array<std::uint8_t, 24> _bytes{};
  std::size_t _size;
};

// A file as the library is to see it: first its header, then the rest.
struct ShownFile {
  explicit ShownFile(std::FILE* file) : rest(file), header(file) {}
  ShownFile(const ShownFile&) = delete;
  ShownFile& operator=(const ShownFile&) = delete;
  ~ShownFile() {
    if (rest != stdin) std::fclose(rest);
  }

  ssize_t read(char* buffer, std::size_t size) {
    const ByteView unread = header.bytes().subspan(headerRead);
    if (unread.empty()) {
      const std::size_t count = std::fread(buffer, 1, size, rest);
      return count == 0 && std::ferror(rest) ? -1 : static_cast<ssize_t>(count);
    }
    const std::size_t count = std::min(size, unread.size());
    std::copy_n(unread.begin(), count, buffer);
    headerRead += count;
    return static_cast<ssize_t>(count);
  }

  std::FILE* rest;
  FileHeader header;
  std::size_t headerRead = 0;
};

// Takes over the file, and closes it when the stream is closed.
std::FILE* streamOf(std::unique_ptr<ShownFile> file) {
  const cookie_io_functions_t operations{
      .read = [](void* shown, char* buffer,
                 std::size_t size) { return static_cast<ShownFile*>(shown)->read(buffer, size); },
      .write = nullptr,
      .seek = nullptr,
      .close =
          [](void* shown) {
            delete static_cast<ShownFile*>(shown);
            return 0;
          },
  };
  std::FILE* stream = ::fopencookie(file.get(), "rb", operations);
  if (!stream) throw std::bad_alloc();
  static_cast<void>(file.release());  // the stream owns it now
  return stream;
}

// Files may hold sub-second parts of more than a second, and of less than nothing.
Time normalised(std::int64_t seconds, std::int64_t nanoseconds) {
  std::int64_t carry = nanoseconds / nanosecondsPerSecond;
  if (nanoseconds % nanosecondsPerSecond < 0) --carry;
  return {seconds + carry, static_cast<std::int32_t>(nanoseconds - carry * nanosecondsPerSecond)};
}

}  // namespace

void CaptureReader::Closer::operator()(pcap* capture) const { pcap_close(capture); }

CaptureReader::CaptureReader(const std::string& path) : _name(path == "-" ? "standard input" : path) {
  std::FILE* file = path == "-" ? stdin : std::fopen(path.c_str(), "rb");
  if (!file) throw CaptureError("cannot open " + _name + ": " + lastSystemError().message());
  _file = file;
  auto shown = std::make_unique<ShownFile>(file);
  if (std::ferror(file)) throw CaptureError("cannot read " + _name + ": " + lastSystemError().message());
  if (shown->header.bytes().empty()) throw CaptureError(_name + " is empty, and so no capture");
  const bool isOfLogChannel = shown->header.isOfLogChannel();
  if (isOfLogChannel) shown->header.announceLongRecords();

  std::FILE* stream = streamOf(std::move(shown));
  char reason[PCAP_ERRBUF_SIZE] = "";
  _capture.reset(pcap_fopen_offline_with_tstamp_precision(stream, PCAP_TSTAMP_PRECISION_NANO, reason));
  if (!_capture) {
    std::fclose(stream);
    throw CaptureError("cannot read " + _name + " as a pcap or pcapng capture: " + reason);
  }
  const int linkType = pcap_datalink(_capture.get());
  if (!isOfLogChannel && linkType != logChannelLinkType)
    throw CaptureError(_name + " has link type " + linkTypeText(linkType) +
                       ", but captures of the log channel have link type 147 (USER0)");
}

bool CaptureReader::next(CaptureRecord& record) {
  pcap_pkthdr* header = nullptr;
  const u_char* bytes = nullptr;
  const int status = pcap_next_ex(_capture.get(), &header, &bytes);
  if (status == PCAP_ERROR_BREAK) return false;
  const std::string place = _name + ", record " + std::to_string(_recordsRead + 1) + ": ";
  if (status != 1) throw CaptureError(place + pcap_geterr(_capture.get()));
  if (header->caplen < header->len)
    throw CaptureError(place + "only " + std::to_string(header->caplen) + " of " +
                       std::to_string(header->len) +
                       " bytes were captured; capture again without a snapshot length");
  ++_recordsRead;
  // Where the sub-second part may be out of order, seconds have 32 bits: the sum does not overflow.
  record = {normalised(header->ts.tv_sec, header->ts.tv_usec), ByteView(bytes, header->caplen)};
  return true;
}

std::uint64_t CaptureReader::bytesRead() const {
  const off_t position = ::ftello(_file);
  return position < 0 ? 0 : static_cast<std::uint64_t>(position);
}

std::optional<std::uint64_t> CaptureReader::fileSize() const {
  struct stat status {};
  if (::fstat(::fileno(_file), &status) != 0 || !S_ISREG(status.st_mode)) return std::nullopt;
  return static_cast<std::uint64_t>(status.st_size);
}

}  // namespace varnel
