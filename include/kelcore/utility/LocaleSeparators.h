// The locale's decimal and thousands separators, and the conversion of number text
// between them and the plain "." and "," that the parser reads.
//
// The pair is process-wide. It is read once, on first use, from the default locale of
// the Unicode library (on POSIX taken from LC_ALL, LC_MESSAGES or LANG; "C" and "POSIX"
// give "." and ","); the first unit of each symbol is kept. When the query fails the
// pair is "." and ",". A later change of the locale is not seen, but a host (or a
// test) may set the pair itself with SetLocaleSeparators.
//
// Thread safety: every function may be called on any thread. The pair is held in one
// atomic word, so a reader always sees a pair that was read or set as a whole; a Set
// racing with the first read wins or loses as a whole.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

struct LocaleSeparators {
  UTF16Char decimal;    // never 0
  UTF16Char thousands;  // 0 when the locale groups no digits
};

KELCORE_API LocaleSeparators GetLocaleSeparators();

// Replaces the pair for the rest of the process (or until the next call). `thousands`
// may be 0 (no grouping). Throws std::invalid_argument when `decimal` is 0.
KELCORE_API void SetLocaleSeparators(UTF16Char decimal, UTF16Char thousands);

// Number text from plain to local form, in place: every "." followed by a digit becomes
// the decimal separator, and every "," followed by a digit the thousands separator
// (left alone when the locale has none). A "digit" is any unit IsNumericChar accepts with
// normalization. The last unit is never changed, so a trailing "." stays.
KELCORE_API void InternationalizeNum(UTF16String& text);

// Number text from local to plain form, in place: first ToNumericCase, then every unit
// equal to the decimal separator becomes "." and, when the locale groups digits, every
// unit equal to the thousands separator becomes ",". The decimal test comes first, so
// when both separators are the same unit, both turn into ".".
KELCORE_API void DeInternationalizeNum(UTF16String& text);

}  // namespace kelcore::utility
