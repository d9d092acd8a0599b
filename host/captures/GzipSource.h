#pragma once

#include <zlib.h>

#include <string>

#include "host/captures/ByteWindow.h"

namespace varnel {

/// Bytes that gzip has packed, in one or several pieces. When the packed bytes are cut off, the source ends
/// after all that it could unpack. Damaged bytes throw CaptureError.
class GzipSource final : public ByteSource {
 public:
  GzipSource(ByteWindow packed, std::string name);
  GzipSource(const GzipSource&) = delete;
  GzipSource& operator=(const GzipSource&) = delete;
  ~GzipSource() override;

  std::size_t read(std::span<std::uint8_t> room) override;
  std::uint64_t bytesRead() const override { return _packed.bytesRead(); }
  std::optional<std::uint64_t> fileSize() const override { return _packed.fileSize(); }

 private:
  bool beginsNextPiece();

  ByteWindow _packed;
  std::string _name;
  z_stream _stream{};
  bool _isAtEnd = false;
};

}  // namespace varnel
