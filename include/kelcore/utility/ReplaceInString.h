// "@" substitution: fills the placeholders "@0" to "@9" of a text.
//
// The text is copied unit by unit: "@" followed by a digit d is replaced by argument d
// (every occurrence, and the argument is not scanned again); "@@" gives one "@"; "@"
// followed by any other unit is kept together with that unit; a lone "@" at the very
// end is kept. Arguments the text does not name are ignored. Pure functions: no state,
// safe on any thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <vector>

namespace kelcore::utility {

KELCORE_API UTF16String
ReplaceInString(const UTF16String& text, const UTF16String& a0 = UTF16String(),
                const UTF16String& a1 = UTF16String(), const UTF16String& a2 = UTF16String(),
                const UTF16String& a3 = UTF16String(), const UTF16String& a4 = UTF16String(),
                const UTF16String& a5 = UTF16String(), const UTF16String& a6 = UTF16String(),
                const UTF16String& a7 = UTF16String(), const UTF16String& a8 = UTF16String(),
                const UTF16String& a9 = UTF16String());

// Takes argument d from arguments[d]; an index the vector does not have stands for an
// empty string, and elements after the tenth are ignored.
KELCORE_API UTF16String ReplaceInString(const UTF16String& text,
                                        const std::vector<UTF16String>& arguments);

}  // namespace kelcore::utility
