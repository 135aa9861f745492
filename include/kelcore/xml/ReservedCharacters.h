// Escaping and unescaping of the five reserved XML characters, for text written into
// and read out of XML documents.
//
// Pure functions of their arguments: reentrant, no shared state; they raise nothing but
// std::bad_alloc and std::length_error from the string types.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::xml::utils {

// Appends `in` to `out` (which is not cleared) with " & ' < > written as &quot; &amp;
// &apos; &lt; &gt;; every other byte is copied as it is, so text that is not UTF-8 passes
// through unchanged. `in` and `out` may be the same string.
KELCORE_API void EncodeReservedCharacters(const UTF8String& in, UTF8String& out);

// Replaces `out` with the escaped form of `in`. The text goes through UTF-8 and back
// (UTF16to8/UTF8to16), so it keeps lone surrogates but ends at its first NUL unit,
// except that an input of fewer than four units keeps its length, the units after a
// NUL becoming NULs. `in` and `out` may be the same string.
KELCORE_API void EncodeReservedCharacters(const UTF16String& in, UTF16String& out);

// Replaces `out` with `in` in which the named references &lt; &gt; &amp; &apos; &quot;
// are turned back into their characters (an empty input empties `out`). Everything else
// passes through unchanged: numeric references (&#65;), other names, a reference without
// its semicolon (&amp at the end, &ltx), a lone ampersand. An ampersand restarts the
// reference being read, so &&lt; gives an ampersand and a less-than sign. `in` and `out`
// may be the same string.
KELCORE_API void DecodeReservedCharacters(const UTF8String& in, UTF8String& out);
// The same on UTF-16 code units, with no conversion.
KELCORE_API void DecodeReservedCharacters(const UTF16String& in, UTF16String& out);

}  // namespace kelcore::xml::utils
