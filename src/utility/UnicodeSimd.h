// Which vector instructions the Unicode block kernels use: SSE2 on x86-64 (always
// there), NEON on arm64 (always there), none elsewhere, where the scalar loops of the
// conversions do all the work. Internal to the library.
#pragma once

#if defined(__SSE2__)
#include <emmintrin.h>
#define KELCORE_UNICODE_SSE2 1
#elif defined(__ARM_NEON) && defined(__aarch64__)
#include <arm_neon.h>
#define KELCORE_UNICODE_NEON 1
#endif

#include <bit>
#include <cstdint>

namespace kelcore::utility::detail {

#if defined(KELCORE_UNICODE_NEON)
// Index of the first byte lane of `flags` (each 00 or FF) that is set; 16 if none.
inline int FirstSetLane(uint8x16_t flags) {
  // Narrowing each 16-bit pair by 4 bits leaves four bits per byte lane.
  const std::uint64_t nibbles =
      vget_lane_u64(vreinterpret_u64_u8(vshrn_n_u16(vreinterpretq_u16_u8(flags), 4)), 0);
  return nibbles == 0 ? 16 : std::countr_zero(nibbles) / 4;
}
#endif

}  // namespace kelcore::utility::detail
