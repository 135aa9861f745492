// Helpers shared by the property list tests.
#pragma once

#include <kelcore/proplist/PropList.h>

#include <ostream>
#include <string>
#include <string_view>

namespace kelcore::proplist {

inline UTF8String U8(std::string_view text) {
  return UTF8String(text.begin(), text.end());
}
inline UTF16String U16(std::u16string_view text) {
  return UTF16String(text.begin(), text.end());
}

// Failure messages show a list as its XML fragment.
inline void PrintTo(const PropList& list, std::ostream* out) {
  UTF8String text;
  list.OutputAsXMLFragment(text);
  *out << "version " << list.GetVersion() << "\n" << std::string(text.begin(), text.end());
}

}  // namespace kelcore::proplist
