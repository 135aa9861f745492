// Case mapping of UTF-16 text, one code unit at a time.
//
// Every unit maps through one table of the Unicode simple (one-to-one) case mappings,
// built once on first use and shared by all four mappings; the first call may take a
// few milliseconds. Because the mapping is per unit and one-to-one, the result always
// has the input's length: "ß" stays "ß" in upper case, and characters outside the
// Basic Multilingual Plane, written as surrogate pairs, are left as they are (surrogate
// units map to themselves). The mappings do not depend on the locale (no Turkish or
// Lithuanian special rules).
//
//   FoldCase: simple case folding, for caseless matching ("ΣΑΣ" and "σας" fold alike).
//   LowerCase, UpperCase: simple lower and upper case.
//   TitleCase: the first unit of each word to title case, the word's other units to
//     lower case. A word is a run of letters, combining marks, digits and other
//     characters that have case, together with surrogate units; an apostrophe (U+0027
//     or U+2019) inside a run continues it. So "o'NEIL's 3D world" gives
//     "O'neil's 3d World", and "ǆemal" gives "ǅemal".
//
// All functions are reentrant; building the table is thread-safe.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

KELCORE_API UTF16String FoldCase(const UTF16String& text);
KELCORE_API UTF16String LowerCase(const UTF16String& text);
KELCORE_API UTF16String UpperCase(const UTF16String& text);
KELCORE_API UTF16String TitleCase(const UTF16String& text);

// The same mappings in place.
KELCORE_API void ToFoldCase(UTF16String& text);
KELCORE_API void ToLowerCase(UTF16String& text);
KELCORE_API void ToUpperCase(UTF16String& text);
KELCORE_API void ToTitleCase(UTF16String& text);

}  // namespace kelcore::utility
