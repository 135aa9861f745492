#include "filesupport/Crc32Block.h"

#include <array>

#if defined(__x86_64__) || defined(__i386__)
#include <immintrin.h>
#define KELCORE_CRC32_CLMUL 1
#endif

namespace kelcore::filesupport {
namespace {

constexpr std::uint32_t kReflectedPolynomial = 0xEDB88320u;

using SliceTables = std::array<std::array<std::uint32_t, 256>, 8>;

constexpr SliceTables MakeSliceTables() {
  SliceTables tables{};
  for (std::uint32_t i = 0; i < 256; ++i) {
    std::uint32_t value = i;
    for (int bit = 0; bit < 8; ++bit)
      value = (value >> 1) ^ ((value & 1u) ? kReflectedPolynomial : 0u);
    tables[0][i] = value;
  }
  for (std::size_t t = 1; t < tables.size(); ++t) {
    for (std::uint32_t i = 0; i < 256; ++i) {
      const std::uint32_t previous = tables[t - 1][i];
      tables[t][i] = (previous >> 8) ^ tables[0][previous & 0xFFu];
    }
  }
  return tables;
}

constexpr SliceTables kSlices = MakeSliceTables();

std::uint32_t LoadLittleEndian32(const unsigned char* p) {
  return static_cast<std::uint32_t>(p[0]) | static_cast<std::uint32_t>(p[1]) << 8 |
         static_cast<std::uint32_t>(p[2]) << 16 | static_cast<std::uint32_t>(p[3]) << 24;
}

#if defined(KELCORE_CRC32_CLMUL)

// Folding with carry-less multiplication: four 128-bit lanes are folded forward by 512
// bits per step, then into one lane, then reduced to 32 bits with a Barrett reduction.
// The constants are x^k mod P(x) for the bit-reflected IEEE polynomial.
__attribute__((target("pclmul,sse4.1"))) inline __m128i Fold(__m128i lane, __m128i constants,
                                                             __m128i next) {
  const __m128i low = _mm_clmulepi64_si128(lane, constants, 0x00);
  const __m128i high = _mm_clmulepi64_si128(lane, constants, 0x11);
  return _mm_xor_si128(_mm_xor_si128(low, high), next);
}

// `size` is at least 64 and a multiple of 16.
__attribute__((target("pclmul,sse4.1"))) std::uint32_t UpdateCrc32Clmul(std::uint32_t reg,
                                                                        const unsigned char* data,
                                                                        std::size_t size) {
  const __m128i k1k2 = _mm_set_epi64x(0x1C6E41596, 0x154442BD4);
  const __m128i k3k4 = _mm_set_epi64x(0x0CCAA009E, 0x1751997D0);
  const __m128i k5 = _mm_set_epi64x(0, 0x163CD6124);
  const __m128i barrett = _mm_set_epi64x(0x1F7011641, 0x1DB710641);
  const __m128i low32 = _mm_set_epi32(0, 0, 0, -1);
  auto load = [](const unsigned char* p) {
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
  };

  __m128i x1 = _mm_xor_si128(load(data), _mm_cvtsi32_si128(static_cast<int>(reg)));
  __m128i x2 = load(data + 16);
  __m128i x3 = load(data + 32);
  __m128i x4 = load(data + 48);
  data += 64;
  size -= 64;
  while (size >= 64) {
    x1 = Fold(x1, k1k2, load(data));
    x2 = Fold(x2, k1k2, load(data + 16));
    x3 = Fold(x3, k1k2, load(data + 32));
    x4 = Fold(x4, k1k2, load(data + 48));
    data += 64;
    size -= 64;
  }
  x1 = Fold(x1, k3k4, x2);
  x1 = Fold(x1, k3k4, x3);
  x1 = Fold(x1, k3k4, x4);
  while (size >= 16) {
    x1 = Fold(x1, k3k4, load(data));
    data += 16;
    size -= 16;
  }
  // 128 bits to 64.
  x1 = _mm_xor_si128(_mm_clmulepi64_si128(x1, k3k4, 0x10), _mm_srli_si128(x1, 8));
  // 64 bits to 32.
  __m128i rest = _mm_srli_si128(x1, 4);
  x1 = _mm_xor_si128(_mm_clmulepi64_si128(_mm_and_si128(x1, low32), k5, 0x00), rest);
  // Barrett reduction to the 32-bit remainder.
  rest = x1;
  x1 = _mm_clmulepi64_si128(_mm_and_si128(x1, low32), barrett, 0x10);
  x1 = _mm_clmulepi64_si128(_mm_and_si128(x1, low32), barrett, 0x00);
  x1 = _mm_xor_si128(x1, rest);
  return static_cast<std::uint32_t>(_mm_extract_epi32(x1, 1));
}

bool HasClmul() {
  static const bool available =
      __builtin_cpu_supports("pclmul") && __builtin_cpu_supports("sse4.1");
  return available;
}

#endif

}  // namespace

std::uint32_t UpdateCrc32Sliced(std::uint32_t reg, const unsigned char* data, std::size_t size) {
  while (size >= 8) {
    const std::uint32_t low = LoadLittleEndian32(data) ^ reg;
    const std::uint32_t high = LoadLittleEndian32(data + 4);
    reg = kSlices[7][low & 0xFF] ^ kSlices[6][(low >> 8) & 0xFF] ^ kSlices[5][(low >> 16) & 0xFF] ^
          kSlices[4][low >> 24] ^ kSlices[3][high & 0xFF] ^ kSlices[2][(high >> 8) & 0xFF] ^
          kSlices[1][(high >> 16) & 0xFF] ^ kSlices[0][high >> 24];
    data += 8;
    size -= 8;
  }
  while (size-- > 0) reg = (reg >> 8) ^ kSlices[0][(reg ^ *data++) & 0xFF];
  return reg;
}

std::uint32_t UpdateCrc32Block(std::uint32_t reg, const unsigned char* data, std::size_t size) {
#if defined(KELCORE_CRC32_CLMUL)
  if (size >= 64 && HasClmul()) {
    const std::size_t folded = size & ~static_cast<std::size_t>(15);
    reg = UpdateCrc32Clmul(reg, data, folded);
    data += folded;
    size -= folded;
  }
#endif
  return UpdateCrc32Sliced(reg, data, size);
}

}  // namespace kelcore::filesupport
