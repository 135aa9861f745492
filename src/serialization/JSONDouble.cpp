// "%.17g" without printf: doubles of ordinary magnitude (1e-3 to 1e15) get their 17
// significant digits exactly from 128-bit integer arithmetic, rounded half to even like
// printf; everything else goes through std::to_chars, which follows printf exactly.
#include "JSONDouble.h"

#include <charconv>
#include <cstdint>
#include <cstring>

namespace kelcore::serialization {
namespace {

constexpr std::uint64_t kPow10[20] = {1ull,
                                      10ull,
                                      100ull,
                                      1000ull,
                                      10000ull,
                                      100000ull,
                                      1000000ull,
                                      10000000ull,
                                      100000000ull,
                                      1000000000ull,
                                      10000000000ull,
                                      100000000000ull,
                                      1000000000000ull,
                                      10000000000000ull,
                                      100000000000000ull,
                                      1000000000000000ull,
                                      10000000000000000ull,
                                      100000000000000000ull,
                                      1000000000000000000ull,
                                      10000000000000000000ull};

#if defined(__SIZEOF_INT128__)
__extension__ typedef unsigned __int128 UInt128;

// round(m * 10^k / 2^shift), ties to even; shift in 1..127.
std::uint64_t ScaleRound(std::uint64_t m, int k, int shift) {
  const UInt128 product = static_cast<UInt128>(m) * kPow10[k];
  const UInt128 quotient = product >> shift;
  const UInt128 rest = product - (quotient << shift);
  const UInt128 half = static_cast<UInt128>(1) << (shift - 1);
  std::uint64_t q = static_cast<std::uint64_t>(quotient);
  if (rest > half || (rest == half && (q & 1) != 0)) ++q;
  return q;
}

// The 17 significant digits of a positive value in [1e-3, 1e15) and its count of digits
// before the point (0 or negative below 1); false when the value is outside that range.
bool SeventeenDigits(double value, std::uint64_t* digits, int* integerDigits) {
  if (!(value >= 1e-3 && value < 1e15)) return false;
  std::uint64_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  const int biased = static_cast<int>(bits >> 52);
  const std::uint64_t m = (bits & ((std::uint64_t{1} << 52) - 1)) | (std::uint64_t{1} << 52);
  const int shift = 1075 - biased;  // value = m / 2^shift; 1 <= shift <= 127 in range
  int d = 1;                        // digits before the point of floor(value)
  if (value >= 1) {
    while (d < 16 && value >= static_cast<double>(kPow10[d])) ++d;
  } else {
    d = value >= 0.1 ? 0 : value >= 0.01 ? -1 : -2;
  }
  std::uint64_t q = ScaleRound(m, 17 - d, shift);
  if (q >= kPow10[17]) {  // rounding carried into an 18th digit
    q = kPow10[16];
    ++d;
  }
  *digits = q;
  *integerDigits = d;
  return true;
}
#else
// Without a 128-bit type every value goes through std::to_chars.
bool SeventeenDigits(double, std::uint64_t*, int*) {
  return false;
}
#endif

}  // namespace

char* FormatJSONDouble(double value, char* buffer, std::size_t size) {
  std::uint64_t digits;
  int integerDigits;
  const bool negative = value < 0;
  if (!SeventeenDigits(negative ? -value : value, &digits, &integerDigits)) {
    return std::to_chars(buffer, buffer + size, value, std::chars_format::general, 17).ptr;
  }
  char text[17];
  for (int i = 16; i >= 0; --i) {
    text[i] = static_cast<char>('0' + digits % 10);
    digits /= 10;
  }
  int last = 16;  // %g drops trailing zeros of the fraction
  while (last >= integerDigits && last > 0 && text[last] == '0') --last;
  char* out = buffer;
  if (negative) *out++ = '-';
  if (integerDigits <= 0) {
    *out++ = '0';
    *out++ = '.';
    for (int i = integerDigits; i < 0; ++i) *out++ = '0';
    std::memcpy(out, text, static_cast<std::size_t>(last + 1));
    return out + last + 1;
  }
  std::memcpy(out, text, static_cast<std::size_t>(integerDigits));
  out += integerDigits;
  if (last >= integerDigits) {
    *out++ = '.';
    const auto fraction = static_cast<std::size_t>(last + 1 - integerDigits);
    std::memcpy(out, text + integerDigits, fraction);
    out += fraction;
  }
  return out;
}

}  // namespace kelcore::serialization
