#include "debug/DebugDatabaseText.h"

#include <algorithm>

namespace kelcore::debug {

void AppendDebugDatabaseLine(UTF8String& text, const UTF8String& key, const UTF8String& value,
                             const UTF8String& defaultValue) {
  text.append(key);
  text.push_back('\t');
  text.append(value);
  text.push_back('\t');
  text.append(defaultValue);
  text.push_back('\r');
  text.push_back('\n');
}

std::vector<DebugDatabaseLine> ParseDebugDatabaseText(const UTF8String& text) {
  std::vector<DebugDatabaseLine> lines;
  const unsigned char* p = text.data();
  const unsigned char* const end = p + text.size();
  while (p != end) {
    const unsigned char* const lineEnd = std::find(p, end, '\n');
    const unsigned char* contentEnd = lineEnd;
    if (contentEnd != p && contentEnd[-1] == '\r') --contentEnd;
    const unsigned char* const firstTab = std::find(p, contentEnd, '\t');
    if (firstTab != contentEnd) {
      // The last TAB: searching backwards from the end stops at the first TAB at worst.
      const unsigned char* lastTab = contentEnd - 1;
      while (*lastTab != '\t') --lastTab;
      DebugDatabaseLine line;
      line.key.assign(p, firstTab);
      if (lastTab == firstTab) {
        line.value.assign(firstTab + 1, contentEnd);
      } else {
        line.value.assign(firstTab + 1, lastTab);
        line.defaultValue.assign(lastTab + 1, contentEnd);
      }
      lines.push_back(std::move(line));
    }
    p = lineEnd == end ? end : lineEnd + 1;
  }
  return lines;
}

}  // namespace kelcore::debug
