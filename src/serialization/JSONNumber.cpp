// Numbers: an integer fast path, std::from_chars for well-formed decimals, and an exact
// rebuild of the lenient forms (stray signs, repeated points, truncated digits).
#include "JSONNumber.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <string>

namespace kelcore::serialization {
namespace {

constexpr std::uint64_t kMax = std::numeric_limits<std::uint64_t>::max();

// One of the three parts of a number. Digits that would overflow are dropped with the
// rest of the part's digits.
struct Part {
  std::uint64_t value = 0;
  std::uint64_t digits = 0;  // digits accumulated (leading zeros included)
  bool overflowed = false;

  void Add(unsigned char c) {
    if (overflowed) return;
    const unsigned digit = c - '0';
    if (value > (kMax - digit) / 10) {
      overflowed = true;
      return;
    }
    value = value * 10 + digit;
    ++digits;
  }
};

NumberScan Integer(bool negative, std::uint64_t magnitude, const unsigned char* end) {
  NumberScan scan;
  scan.end = end;
  if (!negative) {
    scan.kind = NumberScan::kUnsigned;
    scan.unsignedValue = magnitude;
    return scan;
  }
  // A magnitude beyond the signed range loses trailing digits, as overflowing digits do.
  constexpr std::uint64_t kLimit = std::uint64_t{1} << 63;
  while (magnitude > kLimit) magnitude /= 10;
  scan.kind = NumberScan::kSigned;
  scan.signedValue = magnitude == kLimit ? std::numeric_limits<std::int64_t>::min()
                                         : -static_cast<std::int64_t>(magnitude);
  return scan;
}

// from_chars over text that holds a plain decimal; beyond double's range, the infinity or
// zero the decimal tends to. `logMagnitude` estimates log10 of the value.
double ToDouble(const char* begin, const char* end, bool* complete, double logMagnitude,
                bool negative) {
  double value = 0;
  const auto result = std::from_chars(begin, end, value);
  *complete = result.ptr == end;
  if (result.ec == std::errc::result_out_of_range) {
    value = logMagnitude > 0 ? std::numeric_limits<double>::infinity() : 0.0;
    if (negative) value = -value;
  } else if (result.ec != std::errc()) {
    *complete = false;
  }
  return value;
}

}  // namespace

NumberScan ScanJSONNumber(const unsigned char* p, const unsigned char* end) {
  const unsigned char* const start = p;
  const bool negative = *p == '-';
  if (negative) ++p;

  Part parts[3];  // integer, fraction, exponent
  Part* current = &parts[0];
  while (p != end && IsJSONDigit(*p)) current->Add(*p++);
  const auto isNumberByte = [](unsigned char c) {
    return IsJSONDigit(c) || c == '.' || c == 'e' || c == 'E' || c == '+' || c == '-';
  };
  if (p == end || !isNumberByte(*p)) return Integer(negative, parts[0].value, p);

  bool exponentNegative = false;
  for (; p != end && isNumberByte(*p); ++p) {
    const unsigned char c = *p;
    if (IsJSONDigit(c)) {
      current->Add(c);
    } else if (c == '.') {
      current = &parts[1];
      *current = Part();
    } else if (c == 'e' || c == 'E') {
      current = &parts[2];
      *current = Part();
    } else {
      exponentNegative = c == '-';
    }
  }
  const Part& whole = parts[0];
  const Part& fraction = parts[1];
  const Part& exponent = parts[2];
  if (fraction.value == 0 && exponent.value == 0) return Integer(negative, whole.value, p);

  NumberScan scan;
  scan.kind = NumberScan::kDouble;
  scan.end = p;
  const double signedExponent =
      exponentNegative ? -static_cast<double>(exponent.value) : static_cast<double>(exponent.value);
  const double logMagnitude = (whole.value != 0 ? std::log10(static_cast<double>(whole.value))
                                                : std::log10(static_cast<double>(fraction.value)) -
                                                      static_cast<double>(fraction.digits)) +
                              signedExponent;

  // The text itself, when it is a plain decimal whose digits all fit.
  bool complete = false;
  if (!whole.overflowed && !fraction.overflowed && !exponent.overflowed) {
    scan.doubleValue =
        ToDouble(reinterpret_cast<const char*>(start), reinterpret_cast<const char*>(p), &complete,
                 logMagnitude, negative);
    if (complete) return scan;
  }
  // Otherwise the same value rebuilt from the parts as a plain decimal.
  std::string text;
  text.reserve(48 + fraction.digits);
  if (negative) text.push_back('-');
  text += std::to_string(whole.value);
  if (fraction.digits != 0) {
    const std::string digits = std::to_string(fraction.value);
    text.push_back('.');
    text.append(fraction.digits - digits.size(), '0');
    text += digits;
  }
  text.push_back('e');
  if (exponentNegative) text.push_back('-');
  text += std::to_string(exponent.value);
  scan.doubleValue =
      ToDouble(text.data(), text.data() + text.size(), &complete, logMagnitude, negative);
  return scan;
}

}  // namespace kelcore::serialization
