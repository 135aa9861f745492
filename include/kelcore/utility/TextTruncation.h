// Shortening texts to a number of UTF-16 code units, never splitting a surrogate pair.
//
// Lengths and limits count code units. A cut that would leave half of a surrogate pair
// moves so that the half is dropped too: when the last kept unit before a cut would be
// a high surrogate (D800-DBFF) it is not kept, and when the first kept unit after a cut
// would follow a high surrogate it is not kept either. The result may therefore be one
// unit shorter than the limit. Combining marks are not treated specially. All functions
// are pure and reentrant.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <vector>

namespace kelcore::utility {

// The ellipsis "…" (U+2026) that TruncateUIStringInMiddle puts in place of the cut.
inline constexpr UTF16Char kTruncationEllipsis = 0x2026;

// At most `limit` units of `text`: the first ones, or with `keepEnd` the last ones. A
// limit of 0 gives an empty result; a text not longer than the limit is returned as it
// is. No ellipsis is added.
KELCORE_API UTF16String TruncateStringToNumChars(const UTF16String& text, unsigned int limit,
                                                 bool keepEnd);
KELCORE_API std::vector<UTF16Char> TruncateStringToNumChars(const std::vector<UTF16Char>& text,
                                                            unsigned int limit, bool keepEnd);

// Shortens `text` for display to at most `maxUnits` units by replacing a middle part
// with kTruncationEllipsis. A text not longer than `maxUnits` is returned as it is; a
// `maxUnits` of 0 gives an empty result, of 1 the ellipsis alone. Otherwise maxUnits-1
// units of the text are kept, and `position` is the fraction of them placed before the
// ellipsis: round(position * kept) units from the start, the rest from the end. So 0.5
// cuts in the middle, 1 keeps the start (ellipsis last) and 0 the end (ellipsis first).
// `position` is clamped to [0, 1]; NaN counts as 0.5.
// Example: ("Beethoven Symphony 9.flac", 12, 0.5) gives "Beetho….flac".
KELCORE_API UTF16String TruncateUIStringInMiddle(const UTF16String& text, unsigned int maxUnits,
                                                 float position);

}  // namespace kelcore::utility
