// Block kernels of the UTF-16 to UTF-8 conversion: measuring the output before it is
// written, and writing runs of ASCII, two-byte and three-byte characters 8 to 16 units
// at a time. Each kernel has an SSE2, a NEON and a scalar form with identical results
// (the scalar forms of the run writers do nothing and leave the work to the caller).
//
// Every kernel reads only inside the input range it is given and writes only inside
// the output room its contract names. Internal to the library.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <cstdint>

#include "utility/UnicodeSimd.h"

namespace kelcore::utility::detail {

// True when all 16 units at `s` lie in 1-7F: ASCII without a NUL. Subtracting 1 wraps a
// NUL to FFFF, so one unsigned range test rejects both NULs and non-ASCII units.
#if defined(KELCORE_UNICODE_SSE2)
inline bool IsAsciiBlockWithoutNul(const UTF16Char* s) {
  const __m128i one = _mm_set1_epi16(1);
  const __m128i asciiBias = _mm_set1_epi16(0x7F81);  // 1-7F, less 1, stay below 8000
  const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
  const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 8));
  const __m128i biased = _mm_or_si128(_mm_adds_epu16(_mm_sub_epi16(v0, one), asciiBias),
                                      _mm_adds_epu16(_mm_sub_epi16(v1, one), asciiBias));
  return (_mm_movemask_epi8(biased) & 0xAAAA) == 0;
}
#elif defined(KELCORE_UNICODE_NEON)
inline bool IsAsciiBlockWithoutNul(const UTF16Char* s) {
  const uint16x8_t one = vdupq_n_u16(1);
  const uint16x8_t v0 = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s));
  const uint16x8_t v1 = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s + 8));
  return vmaxvq_u16(vmaxq_u16(vsubq_u16(v0, one), vsubq_u16(v1, one))) < 0x7F;
}
#endif

inline bool IsHighSurrogate(unsigned unit) {
  return (unit & 0xFC00) == 0xD800;
}
inline bool IsLowSurrogate(unsigned unit) {
  return (unit & 0xFC00) == 0xDC00;
}

// The part of UTF-16 text before its first NUL unit, and the UTF-8 bytes it converts to.
struct UTF16Measure {
  std::size_t units = 0;
  std::size_t bytes = 0;
};

// Measures [begin, end) up to its first NUL unit. Reads only inside [begin, end).
inline UTF16Measure MeasureUTF16(const UTF16Char* begin, const UTF16Char* end) {
  const UTF16Char* s = begin;
  std::size_t bytes = 0;
  // Blocks of 16 units. An all-ASCII block adds 16. A block with other units adds per
  // lane 3, less 1 below 0x800, less 1 more below 0x80, less 2 for the high half of a
  // pair (whose low half then counts 3); such a block starts a group of 16 measured the
  // same way without the ASCII test, whose outcome mixed text would make unpredictable.
  // The look-ahead load of s[1..16] needs 17 units left. A block with a NUL is left to
  // the scalar loop below.
  constexpr int kGroupBlocks = 16;
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i zero = _mm_setzero_si128();
  const __m128i one = _mm_set1_epi16(1);
  auto laneBytes = [&](__m128i v, __m128i next) {
    const __m128i ascii = _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(-0x80)), zero);
    const __m128i below800 = _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(-0x800)), zero);
    const __m128i surrogateBits = _mm_set1_epi16(-0x400);
    const __m128i pairs =
        _mm_and_si128(_mm_cmpeq_epi16(_mm_and_si128(v, surrogateBits), _mm_set1_epi16(-0x2800)),
                      _mm_cmpeq_epi16(_mm_and_si128(next, surrogateBits), _mm_set1_epi16(-0x2400)));
    return _mm_add_epi16(_mm_add_epi16(_mm_add_epi16(ascii, below800), _mm_add_epi16(pairs, pairs)),
                         _mm_set1_epi16(3));
  };
  bool nul = false;
  while (!nul && end - s > 16) {
    if (IsAsciiBlockWithoutNul(s)) {
      bytes += 16;
      s += 16;
      continue;
    }
    __m128i acc = zero;  // at most 6 per lane and block
    for (int block = 0; block < kGroupBlocks && end - s > 16; ++block, s += 16) {
      const __m128i w0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
      const __m128i w1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 8));
      if (_mm_movemask_epi8(_mm_or_si128(_mm_cmpeq_epi16(w0, zero), _mm_cmpeq_epi16(w1, zero))) !=
          0) {
        nul = true;
        break;
      }
      acc = _mm_add_epi16(acc,
                          laneBytes(w0, _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 1))));
      acc = _mm_add_epi16(acc,
                          laneBytes(w1, _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 9))));
    }
    alignas(16) std::int32_t lanes[4];
    _mm_store_si128(reinterpret_cast<__m128i*>(lanes), _mm_madd_epi16(acc, one));
    bytes += static_cast<std::size_t>(lanes[0]) + static_cast<std::size_t>(lanes[1]) +
             static_cast<std::size_t>(lanes[2]) + static_cast<std::size_t>(lanes[3]);
  }
#elif defined(KELCORE_UNICODE_NEON)
  auto load = [](const UTF16Char* p) {
    return vld1q_u16(reinterpret_cast<const std::uint16_t*>(p));
  };
  auto laneBytes = [](uint16x8_t v, uint16x8_t next) {
    const uint16x8_t surrogateBits = vdupq_n_u16(0xFC00);
    const uint16x8_t pairs =
        vandq_u16(vceqq_u16(vandq_u16(v, surrogateBits), vdupq_n_u16(0xD800)),
                  vceqq_u16(vandq_u16(next, surrogateBits), vdupq_n_u16(0xDC00)));
    const uint16x8_t masks =
        vaddq_u16(vaddq_u16(vcltq_u16(v, vdupq_n_u16(0x80)), vcltq_u16(v, vdupq_n_u16(0x800))),
                  vaddq_u16(pairs, pairs));
    return vaddq_u16(masks, vdupq_n_u16(3));
  };
  bool nul = false;
  while (!nul && end - s > 16) {
    if (IsAsciiBlockWithoutNul(s)) {
      bytes += 16;
      s += 16;
      continue;
    }
    uint16x8_t acc = vdupq_n_u16(0);
    for (int block = 0; block < kGroupBlocks && end - s > 16; ++block, s += 16) {
      const uint16x8_t w0 = load(s);
      const uint16x8_t w1 = load(s + 8);
      if (vminvq_u16(vminq_u16(w0, w1)) == 0) {
        nul = true;
        break;
      }
      acc = vaddq_u16(acc, vaddq_u16(laneBytes(w0, load(s + 1)), laneBytes(w1, load(s + 9))));
    }
    bytes += vaddlvq_u16(acc);
  }
#else
  (void)kGroupBlocks;
#endif
  while (s < end && *s != 0) {
    const unsigned unit = *s++;
    bytes += unit < 0x80 ? 1 : unit < 0x800 ? 2 : 3;
    // A pair takes four bytes, not the six of two lone surrogates.
    if (IsHighSurrogate(unit) && s < end && IsLowSurrogate(*s)) {
      ++bytes;
      ++s;
    }
  }
  return {static_cast<std::size_t>(s - begin), bytes};
}

// Measures [begin, end) up to its first NUL unit like MeasureUTF16, faster, by counting
// every surrogate unit as 2 bytes: exact for text whose surrogates all pair up, and
// short by one byte per lone surrogate otherwise (never more than MeasureUTF16; the
// scalar form, and the tail of the vector forms, count lone surrogates exactly).
// Reads only inside [begin, end).
inline UTF16Measure MeasureUTF16Paired(const UTF16Char* begin, const UTF16Char* end) {
  const UTF16Char* s = begin;
  std::size_t bytes = 0;
  // Blocks of 16 units, as in MeasureUTF16, but without the look-ahead: each lane adds
  // 3, less 1 below 0x800, less 1 more below 0x80, less 1 for a surrogate.
  constexpr int kGroupBlocks = 16;
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i one = _mm_set1_epi16(1);
  const __m128i signBit = _mm_set1_epi16(-0x8000);
  // Signed comparisons of unit ^ 8000 order the units as unsigned.
  const __m128i below80 = _mm_set1_epi16(-0x7F80);
  const __m128i below800 = _mm_set1_epi16(-0x7800);
  // Surrogates D800-DFFF flip to 5800-5FFF.
  const __m128i top5 = _mm_set1_epi16(-0x800);
  const __m128i surrogates = _mm_set1_epi16(0x5800);
  // A group with a NUL, found from its lowest flipped unit, is left to the scalar loop.
  while (end - s >= 16) {
    if (IsAsciiBlockWithoutNul(s)) {
      bytes += 16;
      s += 16;
      continue;
    }
    __m128i acc = _mm_setzero_si128();  // at least -6 per lane and block
    __m128i lowest = _mm_set1_epi16(0x7FFF);
    const int blocks =
        end - s >= 16 * kGroupBlocks ? kGroupBlocks : static_cast<int>((end - s) / 16);
    for (const UTF16Char* p = s; p < s + 16 * blocks; p += 16) {
      const __m128i f0 =
          _mm_xor_si128(_mm_loadu_si128(reinterpret_cast<const __m128i*>(p)), signBit);
      const __m128i f1 =
          _mm_xor_si128(_mm_loadu_si128(reinterpret_cast<const __m128i*>(p + 8)), signBit);
      lowest = _mm_min_epi16(lowest, _mm_min_epi16(f0, f1));
      const __m128i small =
          _mm_add_epi16(_mm_add_epi16(_mm_cmplt_epi16(f0, below80), _mm_cmplt_epi16(f0, below800)),
                        _mm_add_epi16(_mm_cmplt_epi16(f1, below80), _mm_cmplt_epi16(f1, below800)));
      const __m128i surrogate = _mm_add_epi16(_mm_cmpeq_epi16(_mm_and_si128(f0, top5), surrogates),
                                              _mm_cmpeq_epi16(_mm_and_si128(f1, top5), surrogates));
      acc = _mm_add_epi16(acc, _mm_add_epi16(small, surrogate));
    }
    if (_mm_movemask_epi8(_mm_cmpeq_epi16(lowest, signBit)) != 0) break;
    alignas(16) std::int32_t lanes[4];
    _mm_store_si128(reinterpret_cast<__m128i*>(lanes), _mm_madd_epi16(acc, one));
    bytes += static_cast<std::size_t>(48 * blocks + lanes[0] + lanes[1] + lanes[2] + lanes[3]);
    s += 16 * blocks;
  }
#elif defined(KELCORE_UNICODE_NEON)
  auto load = [](const UTF16Char* p) {
    return vld1q_u16(reinterpret_cast<const std::uint16_t*>(p));
  };
  auto laneShortfall = [](uint16x8_t v) {  // 0 to 3: bytes less than 3
    const uint16x8_t surrogate = vceqq_u16(vandq_u16(v, vdupq_n_u16(0xF800)), vdupq_n_u16(0xD800));
    const uint16x8_t masks = vaddq_u16(
        vaddq_u16(vcltq_u16(v, vdupq_n_u16(0x80)), vcltq_u16(v, vdupq_n_u16(0x800))), surrogate);
    return vnegq_s16(vreinterpretq_s16_u16(masks));
  };
  bool nul = false;
  while (!nul && end - s >= 16) {
    if (IsAsciiBlockWithoutNul(s)) {
      bytes += 16;
      s += 16;
      continue;
    }
    int16x8_t acc = vdupq_n_s16(0);
    int blocks = 0;
    for (; blocks < kGroupBlocks && end - s >= 16; ++blocks, s += 16) {
      const uint16x8_t w0 = load(s);
      const uint16x8_t w1 = load(s + 8);
      if (vminvq_u16(vminq_u16(w0, w1)) == 0) {
        nul = true;
        break;
      }
      acc = vaddq_s16(acc, vaddq_s16(laneShortfall(w0), laneShortfall(w1)));
    }
    bytes += static_cast<std::size_t>(48 * blocks - vaddlvq_s16(acc));
  }
#else
  (void)kGroupBlocks;
#endif
  // The low half of a pair split by the blocks' end was counted with its high half.
  if (s > begin && s < end && IsLowSurrogate(*s) && IsHighSurrogate(s[-1])) {
    bytes += 2;
    ++s;
  }
  const UTF16Measure rest = MeasureUTF16(s, end);
  return {static_cast<std::size_t>(s - begin) + rest.units, bytes + rest.bytes};
}

// Writes the leading units of [s, end) that are below 0x80 to `out` as bytes and
// advances both past them. `out` must have room for end - s bytes; bytes past the run
// may be written too, to be overwritten by the caller.
inline void NarrowAsciiRun(const UTF16Char*& s, const UTF16Char* end, unsigned char*& out) {
#if defined(KELCORE_UNICODE_SSE2)
  // Adding 7F80 with unsigned saturation sets bit 15 exactly for units of 0x80 and up.
  const __m128i toSignBit = _mm_set1_epi16(0x7F80);
  while (end - s >= 16) {
    const __m128i v0 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
    const __m128i v1 = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 8));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_packus_epi16(v0, v1));
    const unsigned wide0 = static_cast<unsigned>(_mm_movemask_epi8(_mm_adds_epu16(v0, toSignBit)));
    const unsigned wide1 = static_cast<unsigned>(_mm_movemask_epi8(_mm_adds_epu16(v1, toSignBit)));
    const unsigned nonAscii = ((wide1 << 16) | wide0) & 0xAAAAAAAAu;
    if (nonAscii != 0) {
      const int run = std::countr_zero(nonAscii) / 2;
      s += run;
      out += run;
      return;
    }
    s += 16;
    out += 16;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 16) {
    const uint16x8_t v0 = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s));
    const uint16x8_t v1 = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s + 8));
    // Saturating narrowing keeps the top bit set for every unit of 0x80 and up.
    const uint8x16_t narrowed = vcombine_u8(vqmovn_u16(v0), vqmovn_u16(v1));
    vst1q_u8(out, narrowed);
    if (vmaxvq_u8(narrowed) >= 0x80) {
      const int run = FirstSetLane(vcgeq_u8(narrowed, vdupq_n_u8(0x80)));
      s += run;
      out += run;
      return;
    }
    s += 16;
    out += 16;
  }
#endif
  while (s < end && *s < 0x80) *out++ = static_cast<unsigned char>(*s++);
}

// Writes leading blocks of 8 units that are all in 0080-07FF, two bytes each, and
// advances past them; writes nothing past `outEnd`.
inline void EncodeTwoByteRun(const UTF16Char*& s, const UTF16Char* end, unsigned char*& out,
                             const unsigned char* outEnd) {
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i zero = _mm_setzero_si128();
  const __m128i low6 = _mm_set1_epi16(0x3F);
  while (end - s >= 8 && outEnd - out >= 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
    const int below800 =
        _mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(-0x800)), zero));
    const int ascii =
        _mm_movemask_epi8(_mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(-0x80)), zero));
    if (below800 != 0xFFFF || ascii != 0) return;
    // Lead byte in the low half of each lane, continuation byte in the high half.
    const __m128i lead = _mm_or_si128(_mm_srli_epi16(v, 6), _mm_set1_epi16(0xC0));
    const __m128i trail = _mm_or_si128(_mm_and_si128(v, low6), _mm_set1_epi16(0x80));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_or_si128(lead, _mm_slli_epi16(trail, 8)));
    s += 8;
    out += 16;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 8 && outEnd - out >= 16) {
    const uint16x8_t v = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s));
    if (vminvq_u16(v) < 0x80 || vmaxvq_u16(v) >= 0x800) return;
    const uint8x8x2_t bytes = {
        {vmovn_u16(vorrq_u16(vshrq_n_u16(v, 6), vdupq_n_u16(0xC0))),
         vmovn_u16(vorrq_u16(vandq_u16(v, vdupq_n_u16(0x3F)), vdupq_n_u16(0x80)))}};
    vst2_u8(out, bytes);
    s += 8;
    out += 16;
  }
#else
  (void)s, (void)end, (void)out, (void)outEnd;
#endif
}

// Writes leading blocks of 8 units that are all in 0800-FFFF outside the surrogates,
// three bytes each, and advances past them; writes nothing past `outEnd`. The SSE2 form
// writes up to 2 bytes past each block's 24, to be overwritten by the caller.
inline void EncodeThreeByteRun(const UTF16Char*& s, const UTF16Char* end, unsigned char*& out,
                               const unsigned char* outEnd) {
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i zero = _mm_setzero_si128();
  const __m128i low6 = _mm_set1_epi16(0x3F);
  const __m128i mark = _mm_set1_epi16(0x80);
  const __m128i keepFirst = _mm_set1_epi64x(0xFFFFFF);
  const __m128i keepSecond = _mm_set1_epi64x(0xFFFFFF000000);
  while (end - s >= 8 && outEnd - out >= 26) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
    const __m128i top5 = _mm_and_si128(v, _mm_set1_epi16(-0x800));
    if (_mm_movemask_epi8(_mm_or_si128(_mm_cmpeq_epi16(top5, zero),
                                       _mm_cmpeq_epi16(top5, _mm_set1_epi16(-0x2800)))) != 0) {
      return;
    }
    const __m128i lead = _mm_or_si128(_mm_srli_epi16(v, 12), _mm_set1_epi16(0xE0));
    const __m128i second = _mm_or_si128(_mm_and_si128(_mm_srli_epi16(v, 6), low6), mark);
    const __m128i third = _mm_or_si128(_mm_and_si128(v, low6), mark);
    const __m128i firstTwo = _mm_or_si128(lead, _mm_slli_epi16(second, 8));
    // One unit's three bytes per 32-bit lane, then two units' six bytes per 64-bit lane.
    const __m128i units03 = _mm_unpacklo_epi16(firstTwo, third);
    const __m128i units47 = _mm_unpackhi_epi16(firstTwo, third);
    const __m128i six03 = _mm_or_si128(_mm_and_si128(units03, keepFirst),
                                       _mm_and_si128(_mm_srli_epi64(units03, 8), keepSecond));
    const __m128i six47 = _mm_or_si128(_mm_and_si128(units47, keepFirst),
                                       _mm_and_si128(_mm_srli_epi64(units47, 8), keepSecond));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out), six03);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out + 6), _mm_unpackhi_epi64(six03, six03));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out + 12), six47);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out + 18), _mm_unpackhi_epi64(six47, six47));
    s += 8;
    out += 24;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 8 && outEnd - out >= 24) {
    const uint16x8_t v = vld1q_u16(reinterpret_cast<const std::uint16_t*>(s));
    const uint16x8_t top5 = vandq_u16(v, vdupq_n_u16(0xF800));
    if (vmaxvq_u16(vorrq_u16(vceqzq_u16(top5), vceqq_u16(top5, vdupq_n_u16(0xD800)))) != 0) return;
    const uint16x8_t low6 = vdupq_n_u16(0x3F);
    const uint16x8_t mark = vdupq_n_u16(0x80);
    const uint8x8x3_t bytes = {{vmovn_u16(vorrq_u16(vshrq_n_u16(v, 12), vdupq_n_u16(0xE0))),
                                vmovn_u16(vorrq_u16(vandq_u16(vshrq_n_u16(v, 6), low6), mark)),
                                vmovn_u16(vorrq_u16(vandq_u16(v, low6), mark))}};
    vst3_u8(out, bytes);
    s += 8;
    out += 24;
  }
#else
  (void)s, (void)end, (void)out, (void)outEnd;
#endif
}

}  // namespace kelcore::utility::detail
