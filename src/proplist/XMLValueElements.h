// The XML text of single values, as the property list file format writes them.
//
// Every function appends to `out`, never clears it, and ends the element with a line
// feed. Text is escaped with the five named entities (&quot; &amp; &apos; &lt; &gt;);
// every other byte, control characters and invalid UTF-8 included, is copied as it is.
// Integers are written in plain decimal; floats in the classic locale's general notation
// with 8 significant digits, doubles with 16 (so not every float or double reads back to
// the same bits: that is the format's precision).
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstdint>
#include <string_view>

namespace kelcore::proplist {

// Appends 7-bit text unchanged.
void AppendAscii(std::string_view text, UTF8String& out);
// Appends `text` escaped for XML; text without reserved characters is copied at once.
void AppendEscaped(const UTF8String& text, UTF8String& out);

void AppendValueElement(const UTF16String& value, UTF8String& out);  // <ustring>, as UTF-8
void AppendValueElement(const UTF8String& value, UTF8String& out);   // <string>
void AppendValueElement(bool value, UTF8String& out);                // <true/> or <false/>
void AppendValueElement(std::uint16_t value, UTF8String& out);
void AppendValueElement(std::uint32_t value, UTF8String& out);
void AppendValueElement(std::int32_t value, UTF8String& out);
void AppendValueElement(std::int64_t value, UTF8String& out);
void AppendValueElement(std::uint64_t value, UTF8String& out);
void AppendValueElement(float value, UTF8String& out);
void AppendValueElement(double value, UTF8String& out);

}  // namespace kelcore::proplist
