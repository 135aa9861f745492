#include "CommandText.h"

#include <kelcore/utility/UnicodeConversion.h>

namespace kelcon {

namespace {

bool IsSpace(unsigned int c) {
  return c == ' ' || c == '\t' || c == '\r' || c == '\n';
}

template <typename String>
String Trim(const String& text) {
  std::size_t begin = 0;
  std::size_t end = text.size();
  while (begin < end && IsSpace(static_cast<unsigned int>(text[begin]))) ++begin;
  while (end > begin && IsSpace(static_cast<unsigned int>(text[end - 1]))) --end;
  return text.substr(begin, end - begin);
}

}  // namespace

kelcore::UTF8String ToUTF8(const std::string& utf8) {
  return kelcore::UTF8String(utf8.begin(), utf8.end());
}

kelcore::UTF16String ToUTF16(const std::string& utf8) {
  return kelcore::utility::UTF8to16(ToUTF8(utf8));
}

std::string ToNarrow(const kelcore::UTF16String& text) {
  const kelcore::UTF8String bytes = kelcore::utility::UTF16to8(text);
  return std::string(bytes.begin(), bytes.end());
}

kelcore::UTF16String TrimSpaces(const kelcore::UTF16String& text) {
  return Trim(text);
}
std::string TrimSpaces(const std::string& text) {
  return Trim(text);
}

std::vector<std::string> SplitWords(const std::string& text, std::size_t maxWords) {
  std::vector<std::string> words;
  std::size_t pos = 0;
  while (words.size() < maxWords) {
    while (pos < text.size() && text[pos] == ' ') ++pos;
    if (pos == text.size()) break;
    if (words.size() + 1 == maxWords) {
      words.push_back(TrimSpaces(text.substr(pos)));
      break;
    }
    const std::size_t end = text.find(' ', pos);
    words.push_back(text.substr(pos, end == std::string::npos ? std::string::npos : end - pos));
    pos = end == std::string::npos ? text.size() : end;
  }
  return words;
}

}  // namespace kelcon
