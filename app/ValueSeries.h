#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

namespace varnel {

/// A number of the display at one generation, in 8 bytes. The number is exact: it is kept as decimal digits.
struct StoredSample {
  std::int64_t digits : 37;
  std::uint64_t decimals : 4;
  std::uint64_t isRenewed : 1;
  std::uint64_t generation : 22;  // the low bits of its number

  static constexpr std::uint64_t generationMask = (1U << 22) - 1;

  double value() const;
  /// The sample of a decimal number, as `EntryFormats::number` yields it. Decimals that do not fit are cut.
  /// Absent for an empty text, and when the number has too
  /// many digits before its point.
  static std::optional<StoredSample> ofNumber(std::string_view number);
};
static_assert(sizeof(StoredSample) == 8);

/// The samples of one row in the order of their generations. It allocates memory in blocks only.
class ValueSeries {
 public:
  static constexpr std::size_t samplesPerBlock = 64;
  struct Block {
    std::array<StoredSample, samplesPerBlock> samples;
  };

  std::size_t size() const {
    return _blocks.empty() ? 0 : (_blocks.size() - 1) * samplesPerBlock + _used - _first;
  }
  const StoredSample& operator[](std::size_t index) const {
    index += _first;
    return _blocks[index / samplesPerBlock]->samples[index % samplesPerBlock];
  }

  /// Whether the next sample needs one more block.
  bool isFull() const { return _blocks.empty() || _used == samplesPerBlock; }
  void addBlock();
  /// Makes room for a sample without more memory: the oldest block goes, and becomes the newest one.
  void reuseOldestBlock();
  /// There is room for it.
  void add(const StoredSample& sample) { _blocks.back()->samples[_used++] = sample; }
  /// Drops the oldest samples; at least one stays.
  void dropFirst(std::size_t count);

  /// The memory that the samples take, with what the allocator adds.
  std::size_t bytes() const;
  /// What `addBlock` adds to `bytes`, at most.
  std::size_t bytesOfOneMore() const;

 private:
  std::vector<std::unique_ptr<Block>> _blocks;
  std::size_t _first = 0;  // in the oldest block
  std::size_t _used = 0;   // in the newest block
};

}  // namespace varnel
