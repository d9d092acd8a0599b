#include "host/captures/ChecksumFolding.h"

#include <cstdint>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace varnel {

#if defined(__x86_64__)

namespace {

// A frame is a polynomial over bits. The lowest bit of its first byte belongs to the highest power. With its
// first and its last two bytes inverted, a sound frame is a multiple of x^16 + x^12 + x^5 + 1.
constexpr unsigned divisor = 0x11021, mirroredDivisor = 0x10811;
constexpr unsigned degree = 16;

// The rest of a power of x, in the upper bits of 64. The highest power is in the lowest bit.
constexpr std::uint64_t restOfPower(unsigned power) {
  unsigned rest = 1;
  for (; power > 0; --power) {
    rest <<= 1;
    if (rest >> degree) rest ^= divisor;
  }
  std::uint64_t mirrored = 0;
  for (unsigned i = 0; i < degree; ++i) mirrored |= std::uint64_t{rest >> i & 1} << (63 - i);
  return mirrored;
}

// A multiple of the divisor times this number has the quotient in the lower 64 bits.
constexpr std::uint64_t inverseDivisor() {
  std::uint64_t inverse = 0, rest = 1;
  for (unsigned i = 0; i < 64; ++i) {
    if (!(rest >> i & 1)) continue;
    inverse |= std::uint64_t{1} << i;
    rest ^= std::uint64_t{mirroredDivisor} << i;
  }
  return inverse;
}

// Products of mirrored numbers are one bit lower. So each power is one less than the distance by which it
// moves.
constexpr std::uint64_t by192 = restOfPower(191), by128 = restOfPower(127), by64 = restOfPower(63);

// A window of 16 bytes slides over each array. `places` moves a block's first bytes to its end. `firstTwo`
// marks where the block's first two bytes are then.
constexpr std::uint8_t places[32] = {0x80, 0x80, 0x80, 0x80, 0x80, 0x80, 0x80, 0x80, 0x80, 0x80, 0x80,
                                     0x80, 0x80, 0x80, 0x80, 0x80, 0,    1,    2,    3,    4,    5,
                                     6,    7,    8,    9,    10,   11,   12,   13,   14,   15};
constexpr std::uint8_t firstTwo[48] = {0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0xFF, 0xFF};

__m128i load(const std::uint8_t* bytes) { return _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes)); }

__m128i numbers(std::uint64_t low, std::uint64_t high) {
  return _mm_set_epi64x(static_cast<std::int64_t>(high), static_cast<std::int64_t>(low));
}

}  // namespace

bool canFold() { return __builtin_cpu_supports("pclmul") && __builtin_cpu_supports("ssse3"); }

__attribute__((target("pclmul,ssse3"))) bool isSoundByFolding(ByteView frame) {
  constexpr std::size_t blockSize = leastToFold;
  const std::uint8_t* at = frame.data();
  const std::uint8_t* const end = at + frame.size();
  // The first block has the bytes that do not fill the others. Zeros come before them; they change nothing.
  const std::size_t first = (frame.size() - 1) % blockSize + 1;
  __m128i sum = _mm_xor_si128(_mm_shuffle_epi8(load(at), load(places + first)), load(firstTwo + first));
  __m128i inverted = load(firstTwo + first + blockSize);  // if the first block has only one of the first two

  // Both halves of a block are moved over the next block, as the rest after division.
  const __m128i toNext = numbers(by192, by128);
  for (at += first; at != end; at += blockSize) {
    const __m128i moved =
        _mm_xor_si128(_mm_clmulepi64_si128(sum, toNext, 0x00), _mm_clmulepi64_si128(sum, toNext, 0x11));
    sum = _mm_xor_si128(moved, _mm_xor_si128(load(at), inverted));
    inverted = _mm_setzero_si128();
  }
  sum = _mm_xor_si128(sum, numbers(0, std::uint64_t{0xFFFF} << 48));

  // The lower half is moved over the upper half. First it shrinks to 80 bits, and then to none.
  const __m128i last = numbers(by64, inverseDivisor());
  sum =
      _mm_xor_si128(_mm_clmulepi64_si128(sum, last, 0x00), _mm_and_si128(sum, numbers(0, ~std::uint64_t{0})));
  sum = _mm_xor_si128(_mm_clmulepi64_si128(sum, last, 0x00), sum);
  // The quotient of a multiple of the divisor is shorter by the divisor's degree. For any other number the
  // upper bits of this product are not all 0.
  const __m128i quotient = _mm_clmulepi64_si128(sum, last, 0x11);
  return static_cast<std::uint64_t>(_mm_cvtsi128_si64(quotient)) >> (64 - degree) == 0;
}

#else

bool canFold() { return false; }

bool isSoundByFolding(ByteView /*frame*/) { return false; }

#endif

}  // namespace varnel
