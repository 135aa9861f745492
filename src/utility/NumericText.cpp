#include <kelcore/utility/NumericText.h>

namespace kelcore::utility {
namespace {

constexpr UTF16Char kFullWidthFirst = 0xFF01;
constexpr UTF16Char kFullWidthLast = 0xFF5E;
constexpr UTF16Char kFullWidthOffset = 0xFEE0;
constexpr UTF16Char kArabicIndicZero = 0x0660;
constexpr UTF16Char kArabicIndicNine = 0x0669;
constexpr UTF16Char kArabicIndicOffset = 0x0630;

// The unit with full-width forms and Arabic-Indic digits moved to ASCII.
UTF16Char AsciiTwin(UTF16Char unit) {
  if (unit >= kFullWidthFirst && unit <= kFullWidthLast) {
    return static_cast<UTF16Char>(unit - kFullWidthOffset);
  }
  if (unit >= kArabicIndicZero && unit <= kArabicIndicNine) {
    return static_cast<UTF16Char>(unit - kArabicIndicOffset);
  }
  return unit;
}

}  // namespace

bool IsNumericChar(UTF16Char unit, bool normalize) {
  if (normalize) unit = AsciiTwin(unit);
  return unit >= u'0' && unit <= u'9';
}

bool HasNumericChars(const UTF16String& text, NumberFlags flags) {
  const bool normalize = !flags.Test(kNumberPlainASCII);
  for (UTF16Char unit : text) {
    if (IsNumericChar(unit, normalize)) return true;
  }
  return false;
}

bool ToNumericCase(UTF16Char& unit) {
  UTF16Char plain = unit;
  switch (unit) {
    case 0x3001:  // ideographic comma
      plain = u',';
      break;
    case 0x2212:  // minus sign
      plain = u'-';
      break;
    case 0x3000:  // ideographic space
      plain = u' ';
      break;
    case 0x3002:  // ideographic full stop
      plain = u'.';
      break;
    default:
      plain = AsciiTwin(unit);
      break;
  }
  const bool changed = plain != unit;
  unit = plain;
  return changed;
}

bool ToNumericCase(UTF16String& text) {
  bool changed = false;
  for (UTF16Char& unit : text) changed |= ToNumericCase(unit);
  return changed;
}

}  // namespace kelcore::utility
