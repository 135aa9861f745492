#include <kelcore/utility/MnemonicMarkers.h>

namespace kelcore::utility {

void StripDisplayString(UTF16String& text, bool stripParenthesized) {
  if (text.empty()) return;
  if (stripParenthesized) {
    const std::size_t open = text.find(u"(&");
    if (open != UTF16String::npos && open + 3 < text.size() && text[open + 3] == u')') {
      text.erase(open, 4);
    }
  }
  std::size_t pos = 0;
  for (;;) {
    const std::size_t marker = text.find(u'&', pos);
    if (marker == UTF16String::npos || marker + 1 >= text.size()) return;
    if (text[marker + 1] == u' ') {
      pos = marker + 1;
      continue;
    }
    text.erase(marker, 1);
    // What was "&&" is now one literal "&", which stays.
    pos = text[marker] == u'&' ? marker + 1 : marker;
  }
}

unsigned int LocateSingleAmpersandInString(const UTF16String& text, bool countDoubled) {
  unsigned int doubled = 0;
  std::size_t pos = 0;
  while (pos < text.size()) {
    const std::size_t marker = text.find(u'&', pos);
    if (marker == UTF16String::npos || marker + 1 >= text.size()) break;
    const UTF16Char next = text[marker + 1];
    if (next == u' ') {
      pos = marker + 1;
    } else if (next == u'&') {
      pos = marker + 2;
      if (countDoubled) ++doubled;
    } else {
      const std::size_t position = marker - doubled;
      return position < kNoSingleAmpersand ? static_cast<unsigned int>(position)
                                           : kNoSingleAmpersand;
    }
  }
  return kNoSingleAmpersand;
}

}  // namespace kelcore::utility
