// Reading numbers from UTF-16 text.
//
// StringToNumber prepares a copy of the text and reads it with a standard input string
// stream in the classic "C" locale, over the text's UTF-8 form:
//   1. unless kNumberPlainASCII is set, the copy is de-internationalized
//      (DeInternationalizeNum: other scripts' digits and the locale's separators become
//      ASCII digits, "." and ",");
//   2. every "," is removed (thousands grouping); the typed overloads skip this step
//      when kNumberKeepCommas is set;
//   3. one value is read: leading white space is skipped and reading stops at the first
//      unit that cannot continue the number, so "12 apples" reads 12 and "1.5" read as
//      an integer gives 1. The text ends at its first NUL unit.
// Integers are read in decimal only. The unsigned targets accept a leading "-" and wrap
// it as strtoull does ("-1" gives the type's largest value).
//
// Out-of-range and missing values follow the standard stream rules: text holding no
// number gives 0, and a value beyond the target type's range saturates to the type's
// largest or smallest value (a double or float overflow gives +/- the largest finite
// value). The typed overloads return false in both cases, true when a value of the
// target type was read.
//
// All functions are reentrant; the only shared state read is the locale separator pair.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/NumericText.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

KELCORE_API double StringToNumber(const UTF16String& text, NumberFlags flags = {});

KELCORE_API bool StringToNumber(const UTF16String& text, long& value, NumberFlags flags = {});
KELCORE_API bool StringToNumber(const UTF16String& text, unsigned long& value,
                                NumberFlags flags = {});
KELCORE_API bool StringToNumber(const UTF16String& text, long long& value, NumberFlags flags = {});
KELCORE_API bool StringToNumber(const UTF16String& text, unsigned long long& value,
                                NumberFlags flags = {});
KELCORE_API bool StringToNumber(const UTF16String& text, float& value, NumberFlags flags = {});
KELCORE_API bool StringToNumber(const UTF16String& text, double& value, NumberFlags flags = {});

// Reads hexadecimal text as the C library's strtol (signed) or strtoul (unsigned) does
// with base 16, over the text's UTF-8 form: leading white space, a sign and a "0x" or
// "0X" prefix are accepted, and reading stops at the first unit that is not a hex
// digit. Text without hex digits gives 0; a value out of range saturates (LONG_MAX,
// LONG_MIN or ULONG_MAX); strtoul wraps a leading "-".
KELCORE_API void HexStringToNumber(long& value, const UTF16String& text);
KELCORE_API void HexStringToNumber(unsigned long& value, const UTF16String& text);

// Cleans text typed into a hexadecimal field, in place: upper-cases it (ToUpperCase),
// then removes every unit other than "0"-"9" and "A"-"F".
KELCORE_API void ValidateForHex(UTF16String& text);

}  // namespace kelcore::utility
