// Writing numbers as UTF-16 text for display, in the locale's notation.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/NumericText.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// Formats `value` in fixed notation (never with an exponent):
//   - the value is rounded to nearest at `maxFractionDigits` fraction digits (exactly,
//     from the double's binary value); trailing zeros are then dropped down to
//     `minFractionDigits`, and the decimal separator goes too when no fraction digit
//     remains. A `maxFractionDigits` below `minFractionDigits` counts as equal to it;
//     both are capped at 1074, enough for any double exactly;
//   - the integer part is padded with leading zeros to `minIntegerDigits` digits (at
//     most 400; 0 or less pads nothing, and a value below 1 always shows its "0");
//   - with kNumberGroupThousands the integer digits are grouped by three with the
//     thousands separator;
//   - the decimal and thousands separators are the locale's (GetLocaleSeparators),
//     or "." and "," with kNumberPlainASCII; a locale without a thousands separator
//     groups nothing;
//   - a negative value starts with "-"; a result whose digits are all zero carries no
//     sign.
// StringToNumber reads the result back with the same flags (kNumberPlainASCII set or
// clear as here, kNumberKeepCommas clear). Throws std::domain_error for an infinite or
// NaN value, which has no such text.
//
// Examples with "." and ",": (1234.5, 0, 2, kNumberGroupThousands, 0) gives "1,234.5";
// (1234.5, 2, 2, 0, 0) gives "1234.50"; (0.125, 0, 2, 0, 0) gives "0.12" (the binary
// value is exactly 0.125, a tie, which goes to the even digit); (7, 0, 0, 0, 3) gives
// "007".
KELCORE_API UTF16String NumberToString(double value, unsigned int minFractionDigits,
                                       unsigned int maxFractionDigits, NumberFlags flags,
                                       long minIntegerDigits);

}  // namespace kelcore::utility
