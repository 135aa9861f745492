#include "console/CommandArguments.h"

#include <charconv>
#include <string>

namespace kelcore::commands {

std::vector<UTF16String> SplitWords(const UTF16String& text) {
  std::vector<UTF16String> words;
  std::size_t pos = 0;
  while (pos < text.size()) {
    const std::size_t start = text.find_first_not_of(UTF16Char(' '), pos);
    if (start == UTF16String::npos) break;
    std::size_t end = text.find(UTF16Char(' '), start);
    if (end == UTF16String::npos) end = text.size();
    words.push_back(text.substr(start, end - start));
    pos = end;
  }
  return words;
}

UTF16String TrimSpaces(const UTF16String& text) {
  const std::size_t start = text.find_first_not_of(UTF16Char(' '));
  if (start == UTF16String::npos) return UTF16String();
  const std::size_t end = text.find_last_not_of(UTF16Char(' '));
  return text.substr(start, end - start + 1);
}

std::optional<long> ParseVolume(const UTF16String& word) {
  std::string narrow;
  for (const UTF16Char unit : word) {
    if (unit > 0x7F) return std::nullopt;
    narrow.push_back(static_cast<char>(unit));
  }
  // from_chars takes a '-' but no '+'; "+-1" stays an error.
  std::size_t start = 0;
  if (!narrow.empty() && narrow[0] == '+') {
    if (narrow.size() > 1 && narrow[1] == '-') return std::nullopt;
    start = 1;
  }
  long value = 0;
  const char* first = narrow.data() + start;
  const char* last = narrow.data() + narrow.size();
  const auto result = std::from_chars(first, last, value);
  if (result.ec != std::errc() || result.ptr != last || first == last) return std::nullopt;
  return value;
}

}  // namespace kelcore::commands
