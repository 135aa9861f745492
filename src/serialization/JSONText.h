// Byte classes and string scanning shared by the JSON reader and writer.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <array>
#include <cstdint>
#include <cstring>

namespace kelcore::serialization {

template <class Predicate>
constexpr std::array<bool, 256> MakeByteClass(Predicate predicate) {
  std::array<bool, 256> table{};
  for (int c = 0; c < 256; ++c) table[c] = predicate(c);
  return table;
}

// White space of the C locale: space, TAB, LF, VT, FF, CR.
inline constexpr auto kIsJSONSpace =
    MakeByteClass([](int c) { return c == ' ' || (c >= '\t' && c <= '\r'); });

// The letters a backslash may precede in a JSON string.
inline constexpr auto kIsEscapeLetter = MakeByteClass([](int c) {
  return c == '"' || c == '\\' || c == '/' || c == 'b' || c == 'f' || c == 'n' || c == 'r' ||
         c == 't' || c == 'u';
});

// The first '"' or '\' in [p, end), or end. Eight bytes at a time where it can.
inline const unsigned char* FindQuoteOrBackslash(const unsigned char* p, const unsigned char* end) {
  constexpr std::uint64_t kOnes = 0x0101010101010101ull;
  constexpr std::uint64_t kHighs = 0x8080808080808080ull;
  while (end - p >= 8) {
    std::uint64_t word;
    std::memcpy(&word, p, 8);
    const std::uint64_t quote = word ^ (kOnes * '"');
    const std::uint64_t slash = word ^ (kOnes * '\\');
    const std::uint64_t hits =
        ((quote - kOnes) & ~quote & kHighs) | ((slash - kOnes) & ~slash & kHighs);
    if (hits != 0) break;
    p += 8;
  }
  while (p != end && *p != '"' && *p != '\\') ++p;
  return p;
}

// The contents of a string whose raw bytes (between the quotes) are [begin, end), with
// the escapes resolved. The escape letters were checked already, but a \u must be followed
// by four hexadecimal digits within the range; otherwise throws std::runtime_error
// "EscapeString: unexpected char".
UTF8String UnescapeJSONString(const unsigned char* begin, const unsigned char* end);

}  // namespace kelcore::serialization
