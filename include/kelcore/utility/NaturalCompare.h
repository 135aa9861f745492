// Natural (human) ordering of names: "file2" before "file10", "a007" equal to "a7".
//
// Each text is cut into chunks, maximal runs of units that are all numeric or all
// non-numeric (IsNumericChar with normalization, so full-width and Arabic-Indic digits
// count). The chunk sequences are walked together, pair by pair:
//   - two numeric chunks compare by value: their digits read as a decimal number,
//     leading zeros skipped, saturating at 2^64-1 like StringToNumber into an unsigned
//     64-bit integer (so two runs beyond that are equal). Equal values go on to the
//     next pair: "a007" and "a7" are equal, and full-width digits equal ASCII ones;
//   - when both texts have run out, the result is 0;
//   - otherwise the chunks compare as text, a missing chunk counting as empty (so a
//     text that is a chunk-prefix of another sorts first). Equal chunks go on, any
//     other outcome decides. In this comparison each numeric unit stands for its
//     ASCII digit, so that a numeric chunk sorts against a text chunk the same way
//     whatever its script (digits sort after " ", "-" and "." and before letters).
// The plain functions compare text unit by unit. The CaseInsensitive ones first fold
// "A"-"Z" to "a"-"z" (the C library's tolower in the classic "C" locale; other units,
// non-ASCII letters included, are compared as they are). The fold does not follow the
// process's C locale, so an order once computed stays valid.
//
// Both orderings are strict weak orders (LessThan suits std::sort and std::map). No
// function allocates memory; all are reentrant.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// -1, 0 or 1.
KELCORE_API long NaturalStringCompare(const UTF16String& a, const UTF16String& b);
KELCORE_API bool NaturalStringEquals(const UTF16String& a, const UTF16String& b);
KELCORE_API bool NaturalStringLessThan(const UTF16String& a, const UTF16String& b);

namespace CaseInsensitive {

KELCORE_API long NaturalStringCompare(const UTF16String& a, const UTF16String& b);
KELCORE_API bool NaturalStringEquals(const UTF16String& a, const UTF16String& b);
KELCORE_API bool NaturalStringLessThan(const UTF16String& a, const UTF16String& b);

}  // namespace CaseInsensitive

}  // namespace kelcore::utility
