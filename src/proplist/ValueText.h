// Conversions between the UTF-16 texts the XML parser delivers and the values a property
// list stores, for the property list reader. Pure functions.
#pragma once

#include <kelcore/utility/StringTypes.h>

namespace kelcore::proplist {

// Replaces `out` with `text` in UTF-8, exactly as utility::UTF16to8 converts text
// without NUL units (pairs give four bytes, a lone surrogate the three-byte form of its
// own value), reusing `out`'s capacity.
void AssignUTF8(const UTF16String& text, UTF8String& out);

// The number in `text` as a classic-locale stream extraction into a zeroed variable
// reads it: leading whitespace skipped, the longest number prefix taken, 0 when there is
// none, the largest or smallest value of T when out of range. T is one of the integer
// widths of the file format, float or double.
template <class T>
T ParseNumber(const UTF8String& text);

}  // namespace kelcore::proplist
