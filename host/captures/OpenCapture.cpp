#include <algorithm>

#include "host/captures/BinaryLogCapture.h"
#include "host/captures/Capture.h"
#include "host/captures/CaptureKind.h"
#include "host/captures/FramedCapture.h"
#include "host/captures/GzipSource.h"
#include "host/captures/LengthFramedCapture.h"
#include "host/captures/PcapCapture.h"
#include "host/captures/PcapngCapture.h"
#include "host/captures/RecordStreamCapture.h"

namespace varnel {

namespace {

using Verdict = Recognition::Verdict;

// Reads only as far as it needs to decide.
Recognition recogniseStart(ByteWindow& bytes) {
  for (;;) {
    const Recognition found = recognise(bytes.unread(), Beginning::OfMore);
    if (found.verdict != Verdict::NeedsMore) return found;
    if (!bytes.more()) return recognise(bytes.unread(), Beginning::Whole);
  }
}

template <class Kind>
std::unique_ptr<Capture> make(CaptureInput input) {
  return std::make_unique<Kind>(std::move(input));
}

std::unique_ptr<Capture> captureOfKind(CaptureKind kind, CaptureInput input) {
  switch (kind) {
    case CaptureKind::Pcap:
      return make<PcapCapture>(std::move(input));
    case CaptureKind::Pcapng:
      return make<PcapngCapture>(std::move(input));
    case CaptureKind::LengthFramedStream:
      return make<LengthFramedCapture>(std::move(input));
    case CaptureKind::RecordStream:
      return make<RecordStreamCapture>(std::move(input));
    case CaptureKind::BinaryLog:
      return make<BinaryLogCapture>(std::move(input));
    case CaptureKind::FramedStream:
    case CaptureKind::Gzip:
      break;
  }
  return make<FramedCapture>(std::move(input));
}

}  // namespace

std::unique_ptr<Capture> openCapture(CaptureInput input) {
  Recognition found = recogniseStart(input.bytes);
  std::string separator = " ";
  if (found.verdict == Verdict::Known && found.kind == CaptureKind::Gzip) {
    input.bytes = ByteWindow(std::make_unique<GzipSource>(std::move(input.bytes), input.name));
    found = recogniseStart(input.bytes);
    separator = ", unpacked, ";
    if (found.verdict == Verdict::Known && found.kind == CaptureKind::Gzip)
      throw CaptureError(input.name + " is packed twice; unpack it once, with gzip -d");
  }
  if (found.verdict != Verdict::Known)
    throw CaptureError(input.name + separator + whatElseItIs(input.bytes.unread()));
  input.bytes.drop(found.headerSize);
  return captureOfKind(found.kind, std::move(input));
}

std::unique_ptr<Capture> openCapture(const std::string& path, CaptureOptions options) {
  return openCapture(CaptureInput{.bytes = ByteWindow(openFile(path, options.atEnd)),
                                  .name = captureName(path),
                                  .tell = std::move(options.tell)});
}

}  // namespace varnel
