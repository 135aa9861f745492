// Line endings of UTF-16 text: reading which ones a text uses and converting them.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

enum LineEndingType : int {
  kLineEndingCRLF = 0,
  kLineEndingCR = 1,
  kLineEndingLF = 2,
};

// CR LF, CR or LF; an empty string for any other value.
KELCORE_API UTF16String GetLineEnding(LineEndingType type);

// Rewrites every line ending of `text` (CR LF, a lone CR or a lone LF) as `type`, in
// place. A text whose endings are all of that kind already, or that has none, is left
// untouched (not rebuilt). A final line without an ending gets none.
// Throws std::invalid_argument for a type other than the three above.
KELCORE_API void ConvertLineEndings(LineEndingType type, UTF16String& text);

}  // namespace kelcore::utility
