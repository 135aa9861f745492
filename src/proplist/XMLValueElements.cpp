#include "XMLValueElements.h"

#include <kelcore/utility/UnicodeConversion.h>
#include <kelcore/xml/ReservedCharacters.h>

#include <algorithm>
#include <charconv>

namespace kelcore::proplist {
namespace {

template <class Integer>
void AppendIntElement(std::string_view openTag, Integer value, UTF8String& out) {
  char digits[24];
  const auto result = std::to_chars(digits, digits + sizeof digits, value);
  AppendAscii(openTag, out);
  AppendAscii(std::string_view(digits, static_cast<std::size_t>(result.ptr - digits)), out);
  AppendAscii("</int>\n", out);
}

// The classic locale's general notation with `precision` significant digits, exactly
// what a stream set to that precision writes (printf's "%.*g"), without the stream. A
// float is widened first, as the stream widens it.
template <class Real>
void AppendRealElement(std::string_view name, Real value, int precision, UTF8String& out) {
  char digits[64];
  const auto result = std::to_chars(digits, digits + sizeof digits, static_cast<double>(value),
                                    std::chars_format::general, precision);
  out.push_back('<');
  AppendAscii(name, out);
  out.push_back('>');
  AppendAscii(std::string_view(digits, static_cast<std::size_t>(result.ptr - digits)), out);
  AppendAscii("</", out);
  AppendAscii(name, out);
  AppendAscii(">\n", out);
}

}  // namespace

void AppendAscii(std::string_view text, UTF8String& out) {
  out.append(reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

void AppendEscaped(const UTF8String& text, UTF8String& out) {
  const auto reserved = [](unsigned char c) {
    return c == '"' || c == '&' || c == '\'' || c == '<' || c == '>';
  };
  if (std::none_of(text.begin(), text.end(), reserved)) {
    out.append(text);
  } else {
    xml::utils::EncodeReservedCharacters(text, out);
  }
}

void AppendValueElement(const UTF16String& value, UTF8String& out) {
  AppendAscii("<ustring>", out);
  AppendEscaped(utility::UTF16to8(value), out);
  AppendAscii("</ustring>\n", out);
}

void AppendValueElement(const UTF8String& value, UTF8String& out) {
  AppendAscii("<string>", out);
  AppendEscaped(value, out);
  AppendAscii("</string>\n", out);
}

void AppendValueElement(bool value, UTF8String& out) {
  AppendAscii(value ? "<true/>\n" : "<false/>\n", out);
}

void AppendValueElement(std::uint16_t value, UTF8String& out) {
  AppendIntElement("<int type='unsigned' size='16'>", value, out);
}

void AppendValueElement(std::uint32_t value, UTF8String& out) {
  AppendIntElement("<int type='unsigned' size='32'>", value, out);
}

void AppendValueElement(std::int32_t value, UTF8String& out) {
  AppendIntElement("<int type='signed' size='32'>", value, out);
}

void AppendValueElement(std::int64_t value, UTF8String& out) {
  AppendIntElement("<int type='signed' size='64'>", value, out);
}

void AppendValueElement(std::uint64_t value, UTF8String& out) {
  AppendIntElement("<int type='unsigned' size='64'>", value, out);
}

void AppendValueElement(float value, UTF8String& out) {
  AppendRealElement("float", value, 8, out);
}

void AppendValueElement(double value, UTF8String& out) {
  AppendRealElement("double", value, 16, out);
}

}  // namespace kelcore::proplist
