#include <kelcore/utility/NumberParsing.h>

#include <kelcore/utility/CaseMapping.h>
#include <kelcore/utility/LocaleSeparators.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <cstdlib>
#include <locale>
#include <sstream>
#include <string>

namespace kelcore::utility {
namespace {

UTF16String PreparedNumberText(const UTF16String& text, NumberFlags flags, bool removeCommas) {
  UTF16String prepared(text);
  if (!flags.Test(kNumberPlainASCII)) DeInternationalizeNum(prepared);
  if (removeCommas) std::erase(prepared, u',');
  return prepared;
}

std::string NarrowUTF8(const UTF16String& text) {
  const UTF8String utf8 = UTF16to8(text);
  return std::string(reinterpret_cast<const char*>(utf8.data()), utf8.size());
}

// One value of type T read by a classic-locale stream; the standard stream rules give 0
// for no number and saturate out-of-range values. True when the read succeeded.
template <typename T>
bool ReadNumber(const UTF16String& prepared, T& value) {
  std::istringstream stream(NarrowUTF8(prepared));
  stream.imbue(std::locale::classic());
  T read{};
  stream >> read;
  value = read;
  return !stream.fail();
}

template <typename T>
bool ParseTyped(const UTF16String& text, T& value, NumberFlags flags) {
  return ReadNumber(PreparedNumberText(text, flags, !flags.Test(kNumberKeepCommas)), value);
}

bool IsUpperHexDigit(UTF16Char unit) {
  return (unit >= u'0' && unit <= u'9') || (unit >= u'A' && unit <= u'F');
}

}  // namespace

double StringToNumber(const UTF16String& text, NumberFlags flags) {
  double value = 0;
  ReadNumber(PreparedNumberText(text, flags, true), value);
  return value;
}

bool StringToNumber(const UTF16String& text, long& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}
bool StringToNumber(const UTF16String& text, unsigned long& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}
bool StringToNumber(const UTF16String& text, long long& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}
bool StringToNumber(const UTF16String& text, unsigned long long& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}
bool StringToNumber(const UTF16String& text, float& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}
bool StringToNumber(const UTF16String& text, double& value, NumberFlags flags) {
  return ParseTyped(text, value, flags);
}

void HexStringToNumber(long& value, const UTF16String& text) {
  const std::string narrow = NarrowUTF8(text);
  value = std::strtol(narrow.c_str(), nullptr, 16);
}

void HexStringToNumber(unsigned long& value, const UTF16String& text) {
  const std::string narrow = NarrowUTF8(text);
  value = std::strtoul(narrow.c_str(), nullptr, 16);
}

void ValidateForHex(UTF16String& text) {
  ToUpperCase(text);
  std::erase_if(text, [](UTF16Char unit) { return !IsUpperHexDigit(unit); });
}

}  // namespace kelcore::utility
