// 7-bit literals as UTF16String, for code that must not depend on the width of
// UTF16Char's literal prefix (u"" here, L"" on Windows).
#pragma once

#include <kelcore/utility/UnicodeConversion.h>

#include <cstring>

namespace kelcore::config {

inline UTF16String AsciiText(const char* text) {
  return utility::AsciiToUTF16(text, static_cast<unsigned int>(std::strlen(text)));
}

}  // namespace kelcore::config
