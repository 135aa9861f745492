// Helpers that the built-in commands share for reading their argument text.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <optional>
#include <vector>

namespace kelcore::commands {

// The words of `text`, split at runs of spaces; empty words are dropped.
std::vector<UTF16String> SplitWords(const UTF16String& text);

// `text` without its leading and trailing spaces.
UTF16String TrimSpaces(const UTF16String& text);

// `word` as a base-10 integer of the range of long, with an optional leading '-' or
// '+'; nothing when the word is anything else (a fraction, trailing text, an overflow).
std::optional<long> ParseVolume(const UTF16String& word);

}  // namespace kelcore::commands
