// Conversion between UTF-8 and UTF-16, UTF-8 counting and surrogate classification.
//
// Every function is a pure function of its arguments: reentrant, no shared state, no
// exceptions except std::length_error/std::bad_alloc from the string types.
//
// Neither direction validates strictly. Unpaired surrogates survive both ways: UTF16to8
// writes a lone surrogate as the three-byte form of its own value (ED A0 80 to ED BF BF)
// and UTF8to16 reads those bytes back as the same unit, so any UTF-16 text without NUL
// units round-trips unchanged.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility {

// Result of UTF8to16.
enum UnicodeErrorCode {
  kUnicodeNoError = 0,          // the whole input was converted
  kUnicodeSourceExhausted = 1,  // the input ends inside a multi-byte sequence
  kUnicodeTargetExhausted = 2,  // output space ran out (never from UTF8to16)
  kUnicodeSourceIllegal = 3,    // an illegal sequence; conversion stopped before it
};

enum UnicodeSurrogateT {
  kNotSurrogate = 0,
  kHighSurrogate = 1,
  kLowSurrogate = 2,
};

// UTF-16 to UTF-8. Pairs give four bytes; every other unit, a lone surrogate included,
// is written as the UTF-8 form of its own value. The conversion ends at the first NUL
// unit, except that an input of fewer than four units that holds a NUL keeps the
// input's length: the units after the NUL become zero bytes (so the three units 'a', 0,
// 'b' give the bytes 61 00 00). Never fails.
KELCORE_API UTF8String UTF16to8(const UTF16String& text);
// The same for a NUL-terminated text, which therefore holds no NUL. Null gives an empty
// string.
KELCORE_API UTF8String UTF16to8(const UTF16Char* text);

// UTF-8 to UTF-16 with lenient legality rules. Sequence by sequence:
//  - a lead byte whose announced length (C0-DF 2, E0-EF 3, F0-F7 4, F8-FB 5, FC-FF 6)
//    reaches past the end stops with kUnicodeSourceExhausted, checked first, so a
//    truncated C0 or F8 counts as exhausted rather than illegal;
//  - stray continuation bytes (80-BF), the overlong leads C0 and C1, E0 80-9F and
//    F0 80-8F, leads above F4, F4 followed by anything but 80-8F, five- and six-byte
//    forms, and a missing continuation byte stop with kUnicodeSourceIllegal;
//  - the three-byte forms of D800-DFFF are legal and give those units unchanged, so
//    lone surrogates written by UTF16to8 come back; NUL bytes give NUL units.
// The result holds the units converted before the stop. `error` (the code, or
// kUnicodeNoError) and `length` (units produced) are written when not null. The
// result is the only memory taken; an input of up to 256 bytes whose result fits the
// string's inline buffer takes none.
KELCORE_API UTF16String UTF8to16(const UTF8String& text, UnicodeErrorCode* error = nullptr,
                                 unsigned int* length = nullptr);

// Widens exactly `count` bytes, NULs included. Each byte is sign-extended, so the bytes
// 80-FF become FF80-FFFF: pass 7-bit text only.
KELCORE_API UTF16String AsciiToUTF16(const char* text, unsigned int count);

// The same bytes seen as UTF-8 code units: no copy, no check. Hands a narrow literal
// where UTF-8 is expected.
inline const unsigned char* AsciiToUTF8Impl(const char* text) {
  return reinterpret_cast<const unsigned char*>(text);
}

// Bytes taken by the first `characters` characters of NUL-terminated UTF-8 text,
// stepping from lead byte to lead byte by the length each announces (continuation bytes
// are not checked). A NUL ends the walk early, also one inside the last sequence, which
// then counts up to the NUL; a negative count walks to the NUL. Null text or a count of
// 0 gives 0; a lead byte F8-FF gives -1.
KELCORE_API int GetUTF8ByteCount(const unsigned char* text, int characters);

// Characters that start within the first `bytes` bytes of UTF-8 text, stepping from lead
// byte to lead byte: a last sequence that runs past the limit is counted, and bytes past
// the limit are never read. A NUL within the limit ends the walk (a sequence it cuts
// short is counted). Null text or bytes < 1 gives 0; a lead byte F8-FF gives -1.
KELCORE_API int GetUTF8CharacterCount(const unsigned char* text, int bytes);

// Units before the terminating NUL; null gives 0.
KELCORE_API int UTF16StrLen(const UTF16Char* text);

KELCORE_API UnicodeSurrogateT UnicodeSurrogate(UTF16Char unit);

}  // namespace kelcore::utility
