// Parsing JSON text into a value tree (see <kelcore/serialization/JSONValue.h>).
//
// The reader is lenient in the ways its callers have always relied on:
//  - White space is the C locale's set (space, TAB, LF, VT, FF, CR). Text after the first
//    complete value is ignored; an empty or all-white text gives an empty pointer.
//  - Literals are matched over their own length only: "trueish" reads as true, and the
//    rest is ignored like any trailing text.
//  - A number is a leading '-' followed by any run of digits, '.', 'e', 'E', '+' and '-'.
//    Digits go to the integer part until a '.', which starts the fraction part, or an
//    'e'/'E', which starts the exponent; a '+' or '-' after the leading one sets the
//    exponent's sign (the last one wins). So malformed runs such as "1-2" (twelve) or
//    "1.5.2" (the later '.' restarts the fraction: 1.2) are read, not refused. A digit
//    that would overflow its part's 64-bit accumulator is dropped with the rest of that
//    part's digits (the value is truncated, not scaled).
//    Classification: when the fraction and the exponent are both zero (absent or all
//    zeros: "2.0" and "2e0" count), the number is an integer: std::uint64_t without the
//    leading '-', else std::int64_t (a magnitude above 2^63 loses trailing digits until
//    it fits). Otherwise it is a double, the correctly rounded value of
//    (integer + fraction / 10^fraction digits) * 10^(signed exponent); beyond double's
//    range it becomes +-infinity or +-0.
//  - Strings copy every byte as it is (raw control bytes, NULs and invalid UTF-8
//    included) except escapes: \" \\ \/ \b \f \n \r \t as usual; \uXXXX reads the four
//    hexadecimal digits as a 16-bit number and writes that number's DECIMAL digits into
//    the string ("\u0041" gives "65"). Surrogates get no special treatment. The same
//    rules apply to object keys.
//  - Duplicate keys in an object: the last one wins.
//
// Errors are std::runtime_error with one of these messages (all of them exactly):
//   "ParseValue unexpected char"      a value starts with any other byte
//   "ParsePrimitive unexpected char"  t, f or n not starting true, false or null
//   "AdvanceString: unexpected char"  a bad escape letter, or a string not closed
//   "EscapeString: unexpected char"   \u not followed by four hexadecimal digits
//   "ParseArray unexpected char"      anything but ',' or ']' after an element, or a text
//                                     that ends inside the array
//   "ParseObject unexpected char"     likewise for objects, keys and ':'
// and std::overflow_error (a runtime_error too) for nesting deeper than kMaxJSONDepth.
// Any input bytes either parse or raise one of these; nothing past the given bytes is
// read. std::bad_alloc passes through.
//
// Thread-safe: the functions share no state.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/serialization/JSONValue.h>
#include <kelcore/utility/StringTypes.h>

#include <cstddef>

namespace kelcore::serialization {

KELCORE_API JSONValue JSONParse(const UTF8String& text);
// The text is converted to UTF-8 first (lone surrogates become their three-byte forms).
KELCORE_API JSONValue JSONParse(const UTF16String& text);
// A NUL-terminated text; null reads as the empty text.
KELCORE_API JSONValue JSONParse(const unsigned char* text);
// `count` bytes, NULs included; a count of 0 parses the empty text (`text` may then be
// null).
KELCORE_API JSONValue JSONParse(const unsigned char* text, std::size_t count);

}  // namespace kelcore::serialization
