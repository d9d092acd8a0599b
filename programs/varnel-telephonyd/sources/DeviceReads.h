#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>

#include "base/Bytes.h"
#include "host/captures/CaptureRecord.h"

namespace varnel {

/// Takes the framed stream out of what is read from a port's device. A serial line gives the stream itself.
/// Another character device may give messages: kind (4; 32), number of buffers (4), and for each buffer its
/// length (4) and its bytes, which are the next ones of the stream. The first bytes tell. A message may come
/// in several reads, and a read may have several messages.
class DeviceReads final {
 public:
  enum class Device { SerialLine, Other };
  using Take = std::function<void(ByteView bytes)>;

  /// Bytes that are left out are counted there as noise. It must outlive this object.
  explicit DeviceReads(LeftOut& leftOut) : _counts(leftOut) {}

  /// The device was opened.
  void begin(Device device);
  /// Takes what one read gave, and calls the function with the bytes of the stream in it. Leaves out the rest
  /// of a read in which a message of another kind begins, or one whose numbers cannot be right.
  void take(ByteView read, const Take& takeStream);

 private:
  enum class Form { Unknown, Stream, Messages };
  enum class Part { Kind, Count, Length, Contents };

  void takeMessages(ByteView bytes, const Take& takeStream);
  bool takeNumber(std::uint32_t number);
  void endBuffer();

  LeftOut& _counts;
  Form _form = Form::Stream;
  Bytes _first;  // while the form is not known

  Part _part = Part::Kind;
  Bytes _number;                           // the bytes that have come of a number
  std::uint32_t _buffers = 0, _bytes = 0;  // what is missing of the message, and of its buffer
};

}  // namespace varnel
