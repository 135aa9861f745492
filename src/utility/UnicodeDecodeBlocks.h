// Block kernels of the UTF-8 to UTF-16 conversion: sizing the output from the lead
// bytes, widening runs of ASCII 16 bytes at a time, and decoding runs of two-byte and
// three-byte sequences 8 or 16 at a time. Each kernel has an SSE2, a NEON and a scalar
// form with identical results (the scalar forms of the run decoders do nothing and
// leave the work to the caller).
//
// Every kernel reads only inside the input range it is given and writes only inside
// the output room its contract names. Internal to the library.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <cstdint>

#include "utility/UnicodeSimd.h"

namespace kelcore::utility::detail {

// Upper bound of the UTF-16 units that [begin, end) converts to: exact for valid UTF-8
// (one unit per lead byte, two for F0 and above), larger for invalid text.
inline std::size_t CountUTF16Units(const unsigned char* begin, const unsigned char* end) {
  const unsigned char* s = begin;
  std::size_t continuation = 0;
  std::size_t fourByteLeads = 0;
  constexpr int kBlocksPerFlush = 255;  // 8-bit lane counters
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i zero = _mm_setzero_si128();
  const __m128i f0 = _mm_set1_epi8(static_cast<char>(0xF0));
  while (end - s >= 16) {
    __m128i cont = zero;
    __m128i lead4 = zero;
    for (int blocks = 0; blocks < kBlocksPerFlush && end - s >= 16; ++blocks, s += 16) {
      const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
      // As signed bytes, 80-BF are exactly those below C0 = -64.
      cont = _mm_sub_epi8(cont, _mm_cmplt_epi8(v, _mm_set1_epi8(-64)));
      lead4 = _mm_sub_epi8(lead4, _mm_cmpeq_epi8(_mm_max_epu8(v, f0), v));
    }
    const __m128i contSums = _mm_sad_epu8(cont, zero);
    const __m128i lead4Sums = _mm_sad_epu8(lead4, zero);
    continuation += static_cast<std::size_t>(_mm_cvtsi128_si32(contSums)) +
                    static_cast<std::size_t>(_mm_extract_epi16(contSums, 4));
    fourByteLeads += static_cast<std::size_t>(_mm_cvtsi128_si32(lead4Sums)) +
                     static_cast<std::size_t>(_mm_extract_epi16(lead4Sums, 4));
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 16) {
    uint8x16_t cont = vdupq_n_u8(0);
    uint8x16_t lead4 = vdupq_n_u8(0);
    for (int blocks = 0; blocks < kBlocksPerFlush && end - s >= 16; ++blocks, s += 16) {
      const uint8x16_t v = vld1q_u8(s);
      cont = vsubq_u8(cont, vceqq_u8(vandq_u8(v, vdupq_n_u8(0xC0)), vdupq_n_u8(0x80)));
      lead4 = vsubq_u8(lead4, vcgeq_u8(v, vdupq_n_u8(0xF0)));
    }
    continuation += vaddlvq_u8(cont);
    fourByteLeads += vaddlvq_u8(lead4);
  }
#else
  (void)kBlocksPerFlush;
#endif
  // One unit per byte of the blocks, less their continuation bytes, plus their F0-FF leads.
  std::size_t units = static_cast<std::size_t>(s - begin);
  for (; s < end; ++s) {
    units += (*s & 0xC0) != 0x80;
    units += *s >= 0xF0;
  }
  return units + fourByteLeads - continuation;
}

// Widens the leading bytes of [s, end) that are below 0x80 to units at `out` and
// advances both past them, writing nothing past `outEnd`; units past the run may be
// written too, to be overwritten by the caller.
inline void WidenAsciiRun(const unsigned char*& s, const unsigned char* end, UTF16Char*& out,
                          UTF16Char* outEnd) {
#if defined(KELCORE_UNICODE_SSE2)
  const __m128i zero = _mm_setzero_si128();
  while (end - s >= 16 && outEnd - out >= 16) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_unpacklo_epi8(v, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + 8), _mm_unpackhi_epi8(v, zero));
    const unsigned nonAscii = static_cast<unsigned>(_mm_movemask_epi8(v));
    if (nonAscii != 0) {
      const int run = std::countr_zero(nonAscii);
      s += run;
      out += run;
      return;
    }
    s += 16;
    out += 16;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 16 && outEnd - out >= 16) {
    const uint8x16_t v = vld1q_u8(s);
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out), vmovl_u8(vget_low_u8(v)));
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out + 8), vmovl_high_u8(v));
    if (vmaxvq_u8(v) >= 0x80) {
      const int run = FirstSetLane(vcgeq_u8(v, vdupq_n_u8(0x80)));
      s += run;
      out += run;
      return;
    }
    s += 16;
    out += 16;
  }
#endif
  while (s < end && out < outEnd && *s < 0x80) *out++ = *s++;
}

// Decodes leading blocks of legal two-byte sequences (C2-DF, then 80-BF) and advances
// past them, writing nothing past `outEnd`.
inline void DecodeTwoByteRun(const unsigned char*& s, const unsigned char* end, UTF16Char*& out,
                             UTF16Char* outEnd) {
#if defined(KELCORE_UNICODE_SSE2)
  // Eight sequences per block, one per 16-bit lane: lead in the low byte.
  while (end - s >= 16 && outEnd - out >= 8) {
    const __m128i v = _mm_loadu_si128(reinterpret_cast<const __m128i*>(s));
    const __m128i shape = _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(-0x3F20)),
                                          _mm_set1_epi16(-0x7F40));  // C0E0 -> 80C0
    // C0 and C1 are overlong: bits 1-4 of the lead must not all be zero.
    const __m128i overlong =
        _mm_cmpeq_epi16(_mm_and_si128(v, _mm_set1_epi16(0x1E)), _mm_setzero_si128());
    if (_mm_movemask_epi8(_mm_andnot_si128(overlong, shape)) != 0xFFFF) return;
    const __m128i high = _mm_slli_epi16(_mm_and_si128(v, _mm_set1_epi16(0x1F)), 6);
    const __m128i low = _mm_and_si128(_mm_srli_epi16(v, 8), _mm_set1_epi16(0x3F));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_or_si128(high, low));
    s += 16;
    out += 8;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 32 && outEnd - out >= 16) {
    const uint8x16x2_t v = vld2q_u8(s);
    const uint8x16_t lead = v.val[0];
    const uint8x16_t trail = v.val[1];
    const uint8x16_t ok =
        vandq_u8(vandq_u8(vcgeq_u8(lead, vdupq_n_u8(0xC2)), vcltq_u8(lead, vdupq_n_u8(0xE0))),
                 vceqq_u8(vandq_u8(trail, vdupq_n_u8(0xC0)), vdupq_n_u8(0x80)));
    if (vminvq_u8(ok) == 0) return;
    const uint8x16_t high = vandq_u8(lead, vdupq_n_u8(0x1F));
    const uint8x16_t low = vandq_u8(trail, vdupq_n_u8(0x3F));
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out),
              vorrq_u16(vshlq_n_u16(vmovl_u8(vget_low_u8(high)), 6), vmovl_u8(vget_low_u8(low))));
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out + 8),
              vorrq_u16(vshlq_n_u16(vmovl_high_u8(high), 6), vmovl_high_u8(low)));
    s += 32;
    out += 16;
  }
#else
  (void)s, (void)end, (void)out, (void)outEnd;
#endif
}

// Decodes leading blocks of legal three-byte sequences (E0 A0-BF, or E1-EF 80-BF, then
// 80-BF; the surrogate forms ED A0-BF included) and advances past them, writing nothing
// past `outEnd`.
inline void DecodeThreeByteRun(const unsigned char*& s, const unsigned char* end, UTF16Char*& out,
                               UTF16Char* outEnd) {
#if defined(KELCORE_UNICODE_SSE2)
  // Eight sequences per block, from two loads 12 bytes apart. Shifting a load left by
  // 0-3 bytes brings sequence k (bytes 3k to 3k+2) into 32-bit lane k.
  const __m128i lane0 = _mm_setr_epi32(0xFFFFFF, 0, 0, 0);
  const __m128i lane1 = _mm_setr_epi32(0, 0xFFFFFF, 0, 0);
  const __m128i lane2 = _mm_setr_epi32(0, 0, 0xFFFFFF, 0);
  const __m128i lane3 = _mm_setr_epi32(0, 0, 0, 0xFFFFFF);
  auto spread = [&](__m128i v) {
    return _mm_or_si128(
        _mm_or_si128(_mm_and_si128(v, lane0), _mm_and_si128(_mm_slli_si128(v, 1), lane1)),
        _mm_or_si128(_mm_and_si128(_mm_slli_si128(v, 2), lane2),
                     _mm_and_si128(_mm_slli_si128(v, 3), lane3)));
  };
  auto legal = [](__m128i g) {
    const __m128i shape =
        _mm_cmpeq_epi32(_mm_and_si128(g, _mm_set1_epi32(0xC0C0F0)), _mm_set1_epi32(0x8080E0));
    // After E0 the second byte must be A0-BF: lead bits 0-3 and bit 5 of the second
    // byte may not all be zero.
    const __m128i overlong =
        _mm_cmpeq_epi32(_mm_and_si128(g, _mm_set1_epi32(0x200F)), _mm_setzero_si128());
    return _mm_andnot_si128(overlong, shape);
  };
  auto decode = [](__m128i g) {
    const __m128i unit =
        _mm_or_si128(_mm_slli_epi32(_mm_and_si128(g, _mm_set1_epi32(0x0F)), 12),
                     _mm_or_si128(_mm_srli_epi32(_mm_and_si128(g, _mm_set1_epi32(0x3F00)), 2),
                                  _mm_and_si128(_mm_srli_epi32(g, 16), _mm_set1_epi32(0x3F))));
    // Sign-extended, the 16-bit values survive the signed saturation of the packing.
    return _mm_srai_epi32(_mm_slli_epi32(unit, 16), 16);
  };
  while (end - s >= 28 && outEnd - out >= 8) {
    const __m128i first = spread(_mm_loadu_si128(reinterpret_cast<const __m128i*>(s)));
    const __m128i second = spread(_mm_loadu_si128(reinterpret_cast<const __m128i*>(s + 12)));
    if (_mm_movemask_epi8(_mm_and_si128(legal(first), legal(second))) != 0xFFFF) return;
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out),
                     _mm_packs_epi32(decode(first), decode(second)));
    s += 24;
    out += 8;
  }
#elif defined(KELCORE_UNICODE_NEON)
  while (end - s >= 48 && outEnd - out >= 16) {
    const uint8x16x3_t v = vld3q_u8(s);
    const uint8x16_t lead = v.val[0];
    const uint8x16_t second = v.val[1];
    const uint8x16_t third = v.val[2];
    const uint8x16_t continuation = vdupq_n_u8(0xC0);
    const uint8x16_t shape =
        vandq_u8(vceqq_u8(vandq_u8(lead, vdupq_n_u8(0xF0)), vdupq_n_u8(0xE0)),
                 vandq_u8(vceqq_u8(vandq_u8(second, continuation), vdupq_n_u8(0x80)),
                          vceqq_u8(vandq_u8(third, continuation), vdupq_n_u8(0x80))));
    // After E0 the second byte must be A0-BF.
    const uint8x16_t notOverlong =
        vtstq_u8(vorrq_u8(vandq_u8(lead, vdupq_n_u8(0x0F)), vandq_u8(second, vdupq_n_u8(0x20))),
                 vdupq_n_u8(0xFF));
    if (vminvq_u8(vandq_u8(shape, notOverlong)) == 0) return;
    const uint8x16_t top = vandq_u8(lead, vdupq_n_u8(0x0F));
    const uint8x16_t middle = vandq_u8(second, vdupq_n_u8(0x3F));
    const uint8x16_t bottom = vandq_u8(third, vdupq_n_u8(0x3F));
    const uint16x8_t low = vorrq_u16(vorrq_u16(vshlq_n_u16(vmovl_u8(vget_low_u8(top)), 12),
                                               vshlq_n_u16(vmovl_u8(vget_low_u8(middle)), 6)),
                                     vmovl_u8(vget_low_u8(bottom)));
    const uint16x8_t high = vorrq_u16(
        vorrq_u16(vshlq_n_u16(vmovl_high_u8(top), 12), vshlq_n_u16(vmovl_high_u8(middle), 6)),
        vmovl_high_u8(bottom));
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out), low);
    vst1q_u16(reinterpret_cast<std::uint16_t*>(out + 8), high);
    s += 48;
    out += 16;
  }
#else
  (void)s, (void)end, (void)out, (void)outEnd;
#endif
}

}  // namespace kelcore::utility::detail
