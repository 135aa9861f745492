#include <kelcore/utility/LineEndings.h>

#include <stdexcept>

namespace kelcore::utility {
namespace {

constexpr UTF16Char kCR = u'\r';
constexpr UTF16Char kLF = u'\n';

// Length of the line ending at `pos` (0 when there is none).
std::size_t EndingLength(const UTF16String& text, std::size_t pos) {
  if (text[pos] == kLF) return 1;
  if (text[pos] != kCR) return 0;
  return pos + 1 < text.size() && text[pos + 1] == kLF ? 2 : 1;
}

bool HasOtherEnding(const UTF16String& text, const UTF16String& wanted) {
  for (std::size_t pos = 0; pos < text.size();) {
    const std::size_t length = EndingLength(text, pos);
    if (length == 0) {
      ++pos;
      continue;
    }
    if (text.compare(pos, length, wanted) != 0) return true;
    pos += length;
  }
  return false;
}

}  // namespace

UTF16String GetLineEnding(LineEndingType type) {
  switch (type) {
    case kLineEndingCRLF:
      return u"\r\n";
    case kLineEndingCR:
      return u"\r";
    case kLineEndingLF:
      return u"\n";
  }
  return UTF16String();
}

void ConvertLineEndings(LineEndingType type, UTF16String& text) {
  const UTF16String wanted = GetLineEnding(type);
  if (wanted.empty()) throw std::invalid_argument("ConvertLineEndings: unknown line ending type");
  if (!HasOtherEnding(text, wanted)) return;

  UTF16String converted;
  converted.reserve(text.size() + text.size() / 8);
  for (std::size_t pos = 0; pos < text.size();) {
    const std::size_t length = EndingLength(text, pos);
    if (length == 0) {
      converted.push_back(text[pos++]);
    } else {
      converted.append(wanted);
      pos += length;
    }
  }
  text.swap(converted);
}

}  // namespace kelcore::utility
