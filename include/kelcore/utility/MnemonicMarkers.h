// The "&" access-key markers of menu and dialog texts.
//
// A text marks its access key with "&" before the key's letter. "&&" stands for a
// literal "&", and so does "&" followed by a space. Some languages append the key in
// parentheses instead, as in "Open (&O)". Both functions are pure and reentrant.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// Result of LocateSingleAmpersandInString when the text has no marker.
inline constexpr unsigned int kNoSingleAmpersand = ~0u;

// Removes the markers, in place, leaving the text to show without an access key.
// With `stripParenthesized`, the first "(&" followed two units later by ")" is removed
// first, all four units ("Open (&O)" gives "Open "). Then, from the start, each "&" that
// is not the last unit and not followed by a space is removed; "&&" leaves one "&",
// which is then passed over. "&File" gives "File", "Save && Exit" gives "Save & Exit".
KELCORE_API void StripDisplayString(UTF16String& text, bool stripParenthesized);

// Position of the marker "&": the first "&" that is not the last unit and is followed
// by neither a space nor another "&" (a "&&" pair is passed over as a whole). With
// `countDoubled`, the result is less one for each "&&" pair before the marker, which
// gives the key's position in the text that StripDisplayString leaves (for texts without
// a parenthesized marker). kNoSingleAmpersand when there is no marker.
// "a&&b&c" gives 4, or 3 with `countDoubled`; "a&" gives kNoSingleAmpersand.
KELCORE_API unsigned int LocateSingleAmpersandInString(const UTF16String& text, bool countDoubled);

}  // namespace kelcore::utility
