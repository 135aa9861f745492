// Conversions and word splitting for command lines (UTF-8 in std::string on the
// terminal side, UTF-16 on the console side).
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <string>
#include <vector>

namespace kelcon {

kelcore::UTF16String ToUTF16(const std::string& utf8);
std::string ToNarrow(const kelcore::UTF16String& text);
kelcore::UTF8String ToUTF8(const std::string& utf8);

// `text` without leading and trailing spaces, tabs and line ends.
kelcore::UTF16String TrimSpaces(const kelcore::UTF16String& text);
std::string TrimSpaces(const std::string& text);

// Splits at runs of spaces into at most `maxWords` words; the last word keeps the rest
// of the text, inner spaces included.
std::vector<std::string> SplitWords(const std::string& text, std::size_t maxWords);

}  // namespace kelcon
