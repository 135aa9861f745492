// Reading the lenient JSON number form (see <kelcore/serialization/JSONParse.h>).
#pragma once

#include <cstdint>

namespace kelcore::serialization {

inline bool IsJSONDigit(unsigned char c) {
  return static_cast<unsigned>(c - '0') < 10u;
}

struct NumberScan {
  enum Kind { kUnsigned, kSigned, kDouble };
  Kind kind = kUnsigned;
  const unsigned char* end = nullptr;  // first byte after the number
  std::uint64_t unsignedValue = 0;
  std::int64_t signedValue = 0;
  double doubleValue = 0;
};

// Reads the number that starts at `p` ('-' or a digit; p < end) and classifies it.
// Never reads at or past `end`; never fails.
NumberScan ScanJSONNumber(const unsigned char* p, const unsigned char* end);

}  // namespace kelcore::serialization
