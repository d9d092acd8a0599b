#include "host/OutputFile.h"

#include "host/OutputStream.h"

namespace varnel {

namespace {

constexpr std::size_t pieceSize = std::size_t{1} << 16;

}  // namespace

std::error_code OutputFile::open() {
  if (!isStream(_path)) return _file.emplace(_path).open();
  _stream = openStream(_path);
  return _stream.isOpen() ? std::error_code() : lastSystemError();
}

std::error_code OutputFile::write(ByteView bytes) {
  if (!_file) return writeAll(_stream.number(), bytes);
  if (_gathered.size() + bytes.size() > pieceSize) {
    if (const auto failure = flush()) return failure;
  }
  if (bytes.size() > pieceSize) return _file->write(bytes);
  _gathered.insert(_gathered.end(), bytes.begin(), bytes.end());
  return {};
}

std::error_code OutputFile::finish() {
  if (!_file) return {};
  if (const auto failure = flush()) return failure;
  return _file->finish();
}

std::error_code OutputFile::flush() {
  const auto failure = _file->write(_gathered);
  _gathered.clear();
  return failure;
}

}  // namespace varnel
