#include "host/captures/ChecksumFolding.h"

#include <cstdint>

#if defined(__x86_64__)
#include <immintrin.h>
#endif

namespace varnel {

#if defined(__x86_64__)

namespace {

// A frame is a polynomial over bits: the lowest bit of its first byte belongs to the highest power. It is
// sound when, its first and last two bytes inverted, it is a multiple of this one, x^16 + x^12 + x^5 + 1.
constexpr unsigned divisor = 0x11021, mirroredDivisor = 0x10811;
constexpr unsigned degree = 16;

// What is left of a power of x, as the upper bits of 64, the highest power in the lowest.
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

// By which a multiple of the divisor gives the quotient, in the lower 64 bits of the product.
constexpr std::uint64_t inverseDivisor() {
  std::uint64_t inverse = 0, rest = 1;
  for (unsigned i = 0; i < 64; ++i) {
    if (!(rest >> i & 1)) continue;
    inverse |= std::uint64_t{1} << i;
    rest ^= std::uint64_t{mirroredDivisor} << i;
  }
  return inverse;
}

// Products of mirrored numbers lie one bit lower, so each power is one less than the distance that it moves
// by.
constexpr std::uint64_t by192 = restOfPower(191), by128 = restOfPower(127), by64 = restOfPower(63);

// To slide over, so that a block's first bytes come to its end, and where its first two then are.
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
  // The first block has as many bytes as the others leave, behind zeros, which change nothing.
  const std::size_t first = (frame.size() - 1) % blockSize + 1;
  __m128i sum = _mm_xor_si128(_mm_shuffle_epi8(load(at), load(places + first)), load(firstTwo + first));
  __m128i inverted = load(firstTwo + first + blockSize);  // when the first block has but one of the first two

  // A block's two halves are moved over the next one, and shrink to what the divisor leaves of them.
  const __m128i toNext = numbers(by192, by128);
  for (at += first; at != end; at += blockSize) {
    const __m128i moved =
        _mm_xor_si128(_mm_clmulepi64_si128(sum, toNext, 0x00), _mm_clmulepi64_si128(sum, toNext, 0x11));
    sum = _mm_xor_si128(moved, _mm_xor_si128(load(at), inverted));
    inverted = _mm_setzero_si128();
  }
  sum = _mm_xor_si128(sum, numbers(0, std::uint64_t{0xFFFF} << 48));

  // The lower half is moved over the upper one: it shrinks to 80 bits, and then to none.
  const __m128i last = numbers(by64, inverseDivisor());
  sum =
      _mm_xor_si128(_mm_clmulepi64_si128(sum, last, 0x00), _mm_and_si128(sum, numbers(0, ~std::uint64_t{0})));
  sum = _mm_xor_si128(_mm_clmulepi64_si128(sum, last, 0x00), sum);
  // A multiple of the divisor has a quotient that is shorter by its degree; anything else has none.
  const __m128i quotient = _mm_clmulepi64_si128(sum, last, 0x11);
  return static_cast<std::uint64_t>(_mm_cvtsi128_si64(quotient)) >> (64 - degree) == 0;
}

#else

bool canFold() { return false; }

bool isSoundByFolding(ByteView /*frame*/) { return false; }

#endif

}  // namespace varnel
