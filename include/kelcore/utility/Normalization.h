// Unicode normalization of UTF-16 text.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// Any int converts to this type, so stored settings with other values stay valid.
enum UnicodeNormalizationForm : int {
  kNormalizationFormC = 0,    // canonical composition
  kNormalizationFormD = 1,    // canonical decomposition
  kNormalizationFormKC = 2,   // compatibility composition
  kNormalizationFormKD = 3,   // compatibility decomposition
  kNormalizationNone = 4,     // leave the text unchanged
  kNormalizationNoneAlt = 5,  // leave the text unchanged (kept for stored settings)
};

// `text` in the given form; any value above 5 counts as form C. Forms 4 and 5 return a
// copy of `text`. Otherwise the text up to its first NUL unit is normalized (with the
// Unicode library's normalization data; unpaired surrogates are kept as they are);
// should the normalizer fail, a copy of `text` is returned. Pure and reentrant.
KELCORE_API UTF16String NormalizedString(const UTF16String& text, UnicodeNormalizationForm form);

}  // namespace kelcore::utility
