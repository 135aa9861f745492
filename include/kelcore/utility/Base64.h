// Binary data and UTF-16 text carried inside Base64 text (RFC 4648 alphabet with "="
// padding, no line breaks).
//
// Every function is a pure function of its arguments: reentrant, no shared state. None
// raises an error; failures are reported by the result. Only std::bad_alloc and
// std::length_error from the containers can pass.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/SmallBlockAllocator.h>
#include <kelcore/utility/StringTypes.h>

#include <string>
#include <vector>

namespace kelcore::utility {

using ByteVector = std::vector<unsigned char, SmallBlockAllocator::STLAllocator<unsigned char>>;

// Encodes `size` bytes into `out` (emptied first): four characters per three bytes, the
// last group padded with "=" or "==". Returns false, with `out` empty, when the text
// would be longer than FFFFFFFE characters (more than 3221225469 bytes) or when `data`
// is null and `size` is not 0. Size 0 gives an empty text and true.
KELCORE_API bool EncodeBinaryDataToUTF8String(const unsigned char* data, unsigned int size,
                                              UTF8String& out);

// Decodes Base64 text into `out` (emptied first) and returns true. White space (space,
// TAB, LF, VT, FF, CR) before any character is skipped. "=" in the third slot of a group
// ends that group after one byte, in the fourth slot after two; decoding then goes on
// with the next group, so padded groups may stand inside the text. Any other character,
// "=" in a group's first two slots, or a last group of fewer than four characters makes
// the call return false with `out` empty.
KELCORE_API bool DecodeBinaryDataFromUTF8String(const UTF8String& text, ByteVector& out);

// The units' bytes, low byte first, Base64-encoded (the same text on every platform).
// Empty in, empty out; empty also if the text is too long to encode.
KELCORE_API std::string EncodeUTF16ToAscii(const UTF16String& text);

// The inverse of EncodeUTF16ToAscii, reading up to the first NUL. Bytes pair low byte
// first; an odd last byte is dropped. Text that does not decode gives an empty result.
KELCORE_API UTF16String DecodeUTF16FromAscii(const std::string& text);

}  // namespace kelcore::utility
