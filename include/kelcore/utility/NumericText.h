// Recognition and normalization of digits and number punctuation from other scripts.
//
// Numbers typed by users may use full-width forms (U+FF01-FF5E, the twins of ASCII
// "!" to "~"), Arabic-Indic digits (U+0660-0669) and East Asian punctuation. These
// functions bring such text to plain ASCII digits and punctuation before it is parsed.
// All functions are pure and reentrant.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/Flags.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// Option bits of the number functions (HasNumericChars, StringToNumber, NumberToString).
using NumberFlags = Flags<unsigned short>;
// Plain ASCII text: no digit normalization and no locale separators.
inline constexpr unsigned short kNumberPlainASCII = 2;
// The typed StringToNumber overloads keep "," instead of removing it.
inline constexpr unsigned short kNumberKeepCommas = 4;
// NumberToString groups the integer digits by thousands.
inline constexpr unsigned short kNumberGroupThousands = 8;

// True when `unit` is a decimal digit. With `normalize`, full-width forms are first
// moved to their ASCII twins (minus FEE0) and Arabic-Indic digits to "0"-"9", so
// U+FF10-FF19 and U+0660-0669 count as digits too; without it only "0"-"9" do.
KELCORE_API bool IsNumericChar(UTF16Char unit, bool normalize);

// True when any unit of `text` is numeric, normalizing unless kNumberPlainASCII is set.
KELCORE_API bool HasNumericChars(const UTF16String& text, NumberFlags flags);

// Replaces, in place: U+3001 (ideographic comma) by ",", U+2212 (minus sign) by "-",
// U+3000 (ideographic space) by a space, U+3002 (ideographic full stop) by ".",
// U+FF01-FF5E by their ASCII twins and U+0660-0669 by "0"-"9". Other units stay.
// Returns true when at least one unit was replaced.
KELCORE_API bool ToNumericCase(UTF16String& text);
KELCORE_API bool ToNumericCase(UTF16Char& unit);

}  // namespace kelcore::utility
