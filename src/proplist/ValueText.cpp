#include "ValueText.h"

#include <kelcore/utility/StringStreams.h>

#include <charconv>
#include <cstdint>
#include <type_traits>

namespace kelcore::proplist {
namespace {

bool IsDigit(unsigned char c) {
  return c >= '0' && c <= '9';
}

// Whether `text` is in the plain form that std::from_chars reads exactly as the stream
// does (the form the writer produces): no whitespace, no "+", no "inf" or "nan", and
// for unsigned types no "-" (the stream negates such values modulo 2^n).
template <class T>
bool IsPlainNumber(const UTF8String& text) {
  if (text.empty()) return false;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const unsigned char c = text[i];
    if (IsDigit(c)) continue;
    if constexpr (std::is_floating_point_v<T>) {
      if (c == '.' || c == 'e' || c == 'E') continue;
      if (c == '-' && (i == 0 || text[i - 1] == 'e' || text[i - 1] == 'E')) continue;
      if (c == '+' && i > 0 && (text[i - 1] == 'e' || text[i - 1] == 'E')) continue;
    } else if constexpr (std::is_signed_v<T>) {
      if (c == '-' && i == 0) continue;
    }
    return false;
  }
  return true;
}

}  // namespace

void AssignUTF8(const UTF16String& text, UTF8String& out) {
  out.clear();
  const std::size_t size = text.size();
  for (std::size_t i = 0; i < size; ++i) {
    const std::uint32_t unit = text[i];
    if (unit < 0x80) {
      out.push_back(static_cast<unsigned char>(unit));
    } else if (unit < 0x800) {
      out.push_back(static_cast<unsigned char>(0xC0 | (unit >> 6)));
      out.push_back(static_cast<unsigned char>(0x80 | (unit & 0x3F)));
    } else if (unit >= 0xD800 && unit < 0xDC00 && i + 1 < size && text[i + 1] >= 0xDC00 &&
               text[i + 1] < 0xE000) {
      const std::uint32_t code = 0x10000 + ((unit - 0xD800) << 10) + (text[i + 1] - 0xDC00u);
      ++i;
      out.push_back(static_cast<unsigned char>(0xF0 | (code >> 18)));
      out.push_back(static_cast<unsigned char>(0x80 | ((code >> 12) & 0x3F)));
      out.push_back(static_cast<unsigned char>(0x80 | ((code >> 6) & 0x3F)));
      out.push_back(static_cast<unsigned char>(0x80 | (code & 0x3F)));
    } else {
      out.push_back(static_cast<unsigned char>(0xE0 | (unit >> 12)));
      out.push_back(static_cast<unsigned char>(0x80 | ((unit >> 6) & 0x3F)));
      out.push_back(static_cast<unsigned char>(0x80 | (unit & 0x3F)));
    }
  }
}

template <class T>
T ParseNumber(const UTF8String& text) {
  T value{};
  if (IsPlainNumber<T>(text)) {
    const char* begin = reinterpret_cast<const char*>(text.data());
    const char* end = begin + text.size();
    const auto result = std::from_chars(begin, end, value);
    if (result.ec == std::errc() && result.ptr == end) return value;
    value = T{};
  }
  utility::iUTF8StringStream stream(text);
  stream >> value;
  return value;
}

template std::uint16_t ParseNumber<std::uint16_t>(const UTF8String&);
template std::uint32_t ParseNumber<std::uint32_t>(const UTF8String&);
template std::int32_t ParseNumber<std::int32_t>(const UTF8String&);
template std::int64_t ParseNumber<std::int64_t>(const UTF8String&);
template std::uint64_t ParseNumber<std::uint64_t>(const UTF8String&);
template float ParseNumber<float>(const UTF8String&);
template double ParseNumber<double>(const UTF8String&);

}  // namespace kelcore::proplist
