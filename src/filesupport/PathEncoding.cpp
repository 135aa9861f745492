#include "filesupport/PathEncoding.h"

#include <cstdint>

namespace kelcore::filesupport::detail {

namespace {

constexpr char32_t kEscapeBase = 0xDC00;

bool IsContinuation(unsigned char byte) {
  return (byte & 0xC0) == 0x80;
}

// The length and value of the well-formed UTF-8 sequence at bytes[at], or 0 when the
// byte there does not start one.
std::size_t DecodeSequence(std::string_view bytes, std::size_t at, char32_t& value) {
  const auto lead = static_cast<unsigned char>(bytes[at]);
  if (lead < 0x80) {
    value = lead;
    return 1;
  }
  std::size_t length;
  char32_t minimum;
  if (lead >= 0xC2 && lead <= 0xDF) {
    length = 2, minimum = 0x80, value = lead & 0x1F;
  } else if (lead >= 0xE0 && lead <= 0xEF) {
    length = 3, minimum = 0x800, value = lead & 0x0F;
  } else if (lead >= 0xF0 && lead <= 0xF4) {
    length = 4, minimum = 0x10000, value = lead & 0x07;
  } else {
    return 0;
  }
  if (bytes.size() - at < length) return 0;
  for (std::size_t i = 1; i < length; ++i) {
    const auto byte = static_cast<unsigned char>(bytes[at + i]);
    if (!IsContinuation(byte)) return 0;
    value = (value << 6) | (byte & 0x3F);
  }
  if (value < minimum || value > 0x10FFFF) return 0;
  if (value >= 0xD800 && value <= 0xDFFF) return 0;
  return length;
}

void AppendUtf8(std::string& out, char32_t value) {
  if (value < 0x80) {
    out.push_back(static_cast<char>(value));
  } else if (value < 0x800) {
    out.push_back(static_cast<char>(0xC0 | (value >> 6)));
    out.push_back(static_cast<char>(0x80 | (value & 0x3F)));
  } else if (value < 0x10000) {
    out.push_back(static_cast<char>(0xE0 | (value >> 12)));
    out.push_back(static_cast<char>(0x80 | ((value >> 6) & 0x3F)));
    out.push_back(static_cast<char>(0x80 | (value & 0x3F)));
  } else {
    out.push_back(static_cast<char>(0xF0 | (value >> 18)));
    out.push_back(static_cast<char>(0x80 | ((value >> 12) & 0x3F)));
    out.push_back(static_cast<char>(0x80 | ((value >> 6) & 0x3F)));
    out.push_back(static_cast<char>(0x80 | (value & 0x3F)));
  }
}

}  // namespace

UTF16String DecodePath(std::string_view bytes) {
  UTF16String result;
  result.reserve(bytes.size());
  std::size_t at = 0;
  while (at < bytes.size()) {
    char32_t value = 0;
    const std::size_t length = DecodeSequence(bytes, at, value);
    if (length == 0) {
      result.push_back(static_cast<UTF16Char>(kEscapeBase + static_cast<unsigned char>(bytes[at])));
      ++at;
      continue;
    }
    if (value >= 0x10000) {
      value -= 0x10000;
      result.push_back(static_cast<UTF16Char>(0xD800 + (value >> 10)));
      result.push_back(static_cast<UTF16Char>(0xDC00 + (value & 0x3FF)));
    } else {
      result.push_back(static_cast<UTF16Char>(value));
    }
    at += length;
  }
  return result;
}

std::string EncodePath(const UTF16String& path) {
  std::string result;
  result.reserve(path.size());
  for (std::size_t i = 0; i < path.size(); ++i) {
    const char32_t unit = static_cast<std::uint16_t>(path[i]);
    if (unit >= 0xD800 && unit <= 0xDBFF && i + 1 < path.size()) {
      const char32_t next = static_cast<std::uint16_t>(path[i + 1]);
      if (next >= 0xDC00 && next <= 0xDFFF) {
        AppendUtf8(result, 0x10000 + ((unit - 0xD800) << 10) + (next - 0xDC00));
        ++i;
        continue;
      }
    }
    if (unit >= kEscapeBase + 0x80 && unit <= kEscapeBase + 0xFF) {
      result.push_back(static_cast<char>(unit - kEscapeBase));
    } else {
      AppendUtf8(result, unit);
    }
  }
  return result;
}

}  // namespace kelcore::filesupport::detail
