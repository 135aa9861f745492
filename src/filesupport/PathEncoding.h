// The mapping between UTF-16 paths and the bytes that name files in POSIX system calls.
//
// Names on disk are byte strings, UTF-8 by convention but not by rule. The mapping is
// lossless for every byte string without NUL: EncodePath(DecodePath(b)) == b.
//
// DecodePath (bytes -> UTF-16), sequence by sequence:
//  - a well-formed UTF-8 sequence (shortest form, scalar values up to U+10FFFF, not a
//    surrogate) gives its character, as one unit or a surrogate pair;
//  - every other byte, which is always 0x80-0xFF (a stray continuation byte, a lead byte
//    whose sequence is cut short, overlong or out of range, the three-byte form of a
//    surrogate), gives the lone low surrogate U+DC00 + byte (U+DC80 to U+DCFF), and
//    decoding resumes with the next byte.
// EncodePath (UTF-16 -> bytes), unit by unit:
//  - a high surrogate followed by a low surrogate gives the four-byte UTF-8 form of the
//    pair's character;
//  - a lone U+DC80 to U+DCFF gives the single byte unit - 0xDC00 (the escape above);
//  - any other lone surrogate gives the three-byte form of its own value (ED A0 80 to
//    ED BF BF), which decodes back as three escaped bytes;
//  - every other unit gives its UTF-8 form. A NUL unit gives a NUL byte, which no system
//    call accepts inside a path; callers check with ContainsNul.
// The UTF-16 side therefore round-trips for every text without NUL that holds no lone
// surrogate; UTF-16 holding lone U+DC80-U+DCFF units names the file with those raw bytes.
//
// Pure functions: reentrant, no shared state; only std::bad_alloc is thrown.
#pragma once

#include <string>
#include <string_view>

#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport::detail {

std::string EncodePath(const UTF16String& path);
UTF16String DecodePath(std::string_view bytes);

// True when the bytes hold a NUL, so that they cannot name anything.
inline bool ContainsNul(std::string_view bytes) noexcept {
  return bytes.find('\0') != std::string_view::npos;
}

}  // namespace kelcore::filesupport::detail
