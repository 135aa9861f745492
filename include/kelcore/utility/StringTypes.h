// The two string types that cross kelcore's whole interface.
//
// UTF8String holds UTF-8 in 8-bit unsigned code units; UTF16String holds UTF-16 in
// 16-bit code units in the machine's byte order. Neither type validates its contents:
// unpaired surrogates and stray bytes are carried as they are, and the conversions in
// <kelcore/utility/UnicodeConversion.h> preserve them. Narrow std::string carries
// 7-bit text only (Base64 text, ASCII literals, texts of standard exceptions).
#pragma once

#include <compare>
#include <cstddef>
#include <cstring>
#include <cwchar>
#include <ios>
#include <string>
#include <type_traits>

namespace kelcore {

// A UTF-16 code unit: wchar_t on Windows, where UTF16String is exactly std::wstring,
// and char16_t everywhere else.
#if defined(_WIN32)
using UTF16Char = wchar_t;
#else
using UTF16Char = char16_t;
#endif
static_assert(sizeof(UTF16Char) == 2, "UTF16Char must be a 16-bit code unit");

// Character traits for unsigned char, which the standard library does not promise.
// Comparison is by unsigned byte value, as memcmp compares.
struct UTF8CharTraits {
  using char_type = unsigned char;
  using int_type = int;
  using off_type = std::streamoff;
  using pos_type = std::streampos;
  using state_type = std::mbstate_t;
  using comparison_category = std::strong_ordering;

  static constexpr void assign(char_type& r, const char_type& a) noexcept { r = a; }
  static constexpr bool eq(char_type a, char_type b) noexcept { return a == b; }
  static constexpr bool lt(char_type a, char_type b) noexcept { return a < b; }

  static constexpr int compare(const char_type* a, const char_type* b, std::size_t n) noexcept {
    if (std::is_constant_evaluated()) {
      for (std::size_t i = 0; i < n; ++i) {
        if (a[i] != b[i]) return a[i] < b[i] ? -1 : 1;
      }
      return 0;
    }
    return n == 0 ? 0 : std::memcmp(a, b, n);
  }

  static constexpr std::size_t length(const char_type* s) noexcept {
    std::size_t n = 0;
    while (s[n] != 0) ++n;
    return n;
  }

  static constexpr const char_type* find(const char_type* s, std::size_t n,
                                         const char_type& c) noexcept {
    for (std::size_t i = 0; i < n; ++i) {
      if (s[i] == c) return s + i;
    }
    return nullptr;
  }

  static constexpr char_type* move(char_type* d, const char_type* s, std::size_t n) noexcept {
    if (std::is_constant_evaluated()) {
      if (d < s) {
        for (std::size_t i = 0; i < n; ++i) d[i] = s[i];
      } else {
        for (std::size_t i = n; i > 0; --i) d[i - 1] = s[i - 1];
      }
      return d;
    }
    if (n != 0) std::memmove(d, s, n);
    return d;
  }

  static constexpr char_type* copy(char_type* d, const char_type* s, std::size_t n) noexcept {
    if (std::is_constant_evaluated()) {
      for (std::size_t i = 0; i < n; ++i) d[i] = s[i];
      return d;
    }
    if (n != 0) std::memcpy(d, s, n);
    return d;
  }

  static constexpr char_type* assign(char_type* d, std::size_t n, char_type c) noexcept {
    for (std::size_t i = 0; i < n; ++i) d[i] = c;
    return d;
  }

  static constexpr char_type to_char_type(int_type c) noexcept { return static_cast<char_type>(c); }
  static constexpr int_type to_int_type(char_type c) noexcept { return c; }
  static constexpr bool eq_int_type(int_type a, int_type b) noexcept { return a == b; }
  static constexpr int_type eof() noexcept { return -1; }
  static constexpr int_type not_eof(int_type c) noexcept { return c == eof() ? 0 : c; }
};

using UTF8String = std::basic_string<unsigned char, UTF8CharTraits>;
using UTF16String = std::basic_string<UTF16Char>;

}  // namespace kelcore
