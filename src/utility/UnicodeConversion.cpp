#include <kelcore/utility/UnicodeConversion.h>

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

#include "utility/UnicodeDecodeBlocks.h"
#include "utility/UnicodeEncodeBlocks.h"

namespace kelcore::utility {
namespace {

using detail::IsHighSurrogate;
using detail::IsLowSurrogate;

// Trailing bytes announced by a lead byte: 00-BF 0, C0-DF 1, E0-EF 2, F0-F7 3, F8-FB 4,
// FC-FF 5. Continuation bytes count as leads of no trailing byte.
constexpr unsigned TrailingBytes(unsigned lead) {
  return lead < 0xC0   ? 0
         : lead < 0xE0 ? 1
         : lead < 0xF0 ? 2
         : lead < 0xF8 ? 3
         : lead < 0xFC ? 4
                       : 5;
}

bool IsContinuation(unsigned byte) {
  return (byte & 0xC0) == 0x80;
}

// Writes the units of [s, end) one at a time from the current one on, until two ASCII
// units in a row suggest a run for the block writer. Single ASCII units between other
// characters (spaces between emoji, letters between accents) are cheaper here. `out`
// has room for the whole conversion, which ends at `outEnd`, unless `roomForLone` is
// false: then the room counted lone surrogates as 2 bytes, and the writer stops before
// the first one. Returns false if it stopped there, true otherwise.
bool EncodeUnitsUntilAsciiRun(const UTF16Char*& s, const UTF16Char* end, unsigned char*& out,
                              const unsigned char* outEnd, bool roomForLone) {
  int asciiInARow = 0;
  while (s < end) {
    const unsigned unit = *s;
    if (unit < 0x80) {
      *out++ = static_cast<unsigned char>(unit);
      ++s;
      if (++asciiInARow == 2) return true;
      continue;
    }
    asciiInARow = 0;
    if (unit < 0x800) {
      if constexpr (std::endian::native == std::endian::little) {
        // One 16-bit store, first byte lowest.
        const std::uint16_t bytes =
            static_cast<std::uint16_t>(0x80C0 | (unit >> 6) | ((unit & 0x3F) << 8));
        std::memcpy(out, &bytes, 2);
      } else {
        out[0] = static_cast<unsigned char>(0xC0 | (unit >> 6));
        out[1] = static_cast<unsigned char>(0x80 | (unit & 0x3F));
      }
      out += 2;
      ++s;
      // A second such unit suggests a run: try whole blocks.
      if (s < end && *s >= 0x80 && *s < 0x800) detail::EncodeTwoByteRun(s, end, out, outEnd);
    } else if (IsHighSurrogate(unit) && end - s > 1 && IsLowSurrogate(s[1])) {
      const std::uint32_t cp = ((unit - 0xD800) << 10) + (s[1] - 0xDC00u) + 0x10000;
      if constexpr (std::endian::native == std::endian::little) {
        // One 32-bit store, first byte lowest.
        const std::uint32_t bytes = 0x808080F0u | (cp >> 18) | ((cp >> 4) & 0x3F00) |
                                    ((cp << 10) & 0x3F0000) | ((cp & 0x3F) << 24);
        std::memcpy(out, &bytes, 4);
      } else {
        out[0] = static_cast<unsigned char>(0xF0 | (cp >> 18));
        out[1] = static_cast<unsigned char>(0x80 | ((cp >> 12) & 0x3F));
        out[2] = static_cast<unsigned char>(0x80 | ((cp >> 6) & 0x3F));
        out[3] = static_cast<unsigned char>(0x80 | (cp & 0x3F));
      }
      out += 4;
      s += 2;
    } else {
      // Lone surrogates too are written as the three bytes of their own value.
      if (!roomForLone && (unit & 0xF800) == 0xD800) return false;
      out[0] = static_cast<unsigned char>(0xE0 | (unit >> 12));
      out[1] = static_cast<unsigned char>(0x80 | ((unit >> 6) & 0x3F));
      out[2] = static_cast<unsigned char>(0x80 | (unit & 0x3F));
      out += 3;
      ++s;
      if (s < end && *s >= 0x800) detail::EncodeThreeByteRun(s, end, out, outEnd);
    }
  }
  return true;
}

UTF8String ConvertUTF16ToUTF8(const UTF16Char* text, std::size_t count) {
  UTF8String result;
  if (count == 0) return result;
  // Sized for surrogate pairs; a lone surrogate, rare, takes one byte more, and the
  // first one met resizes the string for the exact remainder.
  const detail::UTF16Measure measure = detail::MeasureUTF16Paired(text, text + count);
  // A short input holding a NUL keeps its length: the units after the NUL become zero
  // bytes. Longer inputs end at the NUL.
  const std::size_t padding = count < 4 ? count - measure.units : 0;
  result.resize(measure.bytes + padding);

  unsigned char* out = result.data();
  const unsigned char* outEnd = out + measure.bytes;
  const UTF16Char* s = text;
  const UTF16Char* const end = text + measure.units;
  bool roomForLone = false;
  while (s < end) {
    detail::NarrowAsciiRun(s, end, out);
    if (!EncodeUnitsUntilAsciiRun(s, end, out, outEnd, roomForLone)) {
      const std::size_t written = static_cast<std::size_t>(out - result.data());
      const std::size_t bytes = written + detail::MeasureUTF16(s, end).bytes;
      result.resize(bytes + padding);
      out = result.data() + written;
      outEnd = result.data() + bytes;
      roomForLone = true;
    }
  }
  return result;
}

// Decodes the sequences of [s, end) from the current one up to the next ASCII byte.
// Stops before an illegal or incomplete sequence and returns its code. `out` has room
// for the whole conversion, which ends at `outEnd`.
UnicodeErrorCode DecodeNonAsciiRun(const unsigned char*& s, const unsigned char* end,
                                   UTF16Char*& out, UTF16Char* outEnd) {
  while (s < end) {
    const unsigned lead = *s;
    if (lead < 0x80) break;
    const std::ptrdiff_t left = end - s;
    if (left >= 4) {
      // The common legal forms, recognised from four bytes at once (first byte lowest).
      const std::uint32_t word = s[0] | (s[1] << 8) | (s[2] << 16) | (std::uint32_t{s[3]} << 24);
      if ((word & 0xC0C0F0) == 0x8080E0 && (lead != 0xE0 || s[1] >= 0xA0)) {
        *out++ = static_cast<UTF16Char>(((word & 0x0F) << 12) | ((word & 0x3F00) >> 2) |
                                        ((word >> 16) & 0x3F));
        s += 3;
        // A second such sequence suggests a run: try whole blocks.
        if (s < end && (*s & 0xF0) == 0xE0) detail::DecodeThreeByteRun(s, end, out, outEnd);
        continue;
      }
      if ((word & 0xC0E0) == 0x80C0 && lead >= 0xC2) {
        *out++ = static_cast<UTF16Char>(((word & 0x1F) << 6) | ((word >> 8) & 0x3F));
        s += 2;
        if (s < end && (*s & 0xE0) == 0xC0) detail::DecodeTwoByteRun(s, end, out, outEnd);
        continue;
      }
      if ((word & 0xC0C0C0F8) == 0x808080F0) {
        const std::uint32_t cp = ((word & 0x07) << 18) | ((word & 0x3F00) << 4) |
                                 ((word >> 10) & 0xFC0) | ((word >> 24) & 0x3F);
        // Overlong forms fall below 10000, F4 90 and up and F5-F7 above 10FFFF.
        if (cp >= 0x10000 && cp <= 0x10FFFF) {
          out[0] = static_cast<UTF16Char>(((cp - 0x10000) >> 10) + 0xD800);
          out[1] = static_cast<UTF16Char>(((cp - 0x10000) & 0x3FF) + 0xDC00);
          out += 2;
          s += 4;
          continue;
        }
      }
    }
    if (left <= static_cast<std::ptrdiff_t>(TrailingBytes(lead))) return kUnicodeSourceExhausted;
    if (lead < 0xE0) {
      // 80-BF are stray continuation bytes; C0 and C1 would be overlong forms.
      if (lead < 0xC2 || !IsContinuation(s[1])) return kUnicodeSourceIllegal;
      *out++ = static_cast<UTF16Char>(((lead & 0x1F) << 6) | (s[1] & 0x3F));
      s += 2;
    } else if (lead < 0xF0) {
      // E0 80-9F would be overlong. ED A0-BF, the surrogates, are accepted on purpose.
      const unsigned second = s[1];
      if (second < (lead == 0xE0 ? 0xA0u : 0x80u) || second > 0xBF || !IsContinuation(s[2])) {
        return kUnicodeSourceIllegal;
      }
      *out++ =
          static_cast<UTF16Char>(((lead & 0x0F) << 12) | ((second & 0x3F) << 6) | (s[2] & 0x3F));
      s += 3;
    } else {
      // F0 80-8F would be overlong, F4 90 and up or F5-FF beyond 10FFFF; sequences of
      // five and six bytes are never legal. The legal ones stay within 10000-10FFFF.
      const unsigned second = s[1];
      if (lead > 0xF4 || second < (lead == 0xF0 ? 0x90u : 0x80u) ||
          second > (lead == 0xF4 ? 0x8Fu : 0xBFu) || !IsContinuation(s[2]) ||
          !IsContinuation(s[3])) {
        return kUnicodeSourceIllegal;
      }
      const std::uint32_t cp =
          ((lead & 0x07) << 18) | ((second & 0x3F) << 12) | ((s[2] & 0x3Fu) << 6) | (s[3] & 0x3Fu);
      out[0] = static_cast<UTF16Char>(((cp - 0x10000) >> 10) + 0xD800);
      out[1] = static_cast<UTF16Char>(((cp - 0x10000) & 0x3FF) + 0xDC00);
      out += 2;
      s += 4;
    }
  }
  return kUnicodeNoError;
}

}  // namespace

UTF8String UTF16to8(const UTF16String& text) {
  return ConvertUTF16ToUTF8(text.data(), text.size());
}

UTF8String UTF16to8(const UTF16Char* text) {
  if (text == nullptr) return UTF8String();
  return ConvertUTF16ToUTF8(text, std::char_traits<UTF16Char>::length(text));
}

UTF16String UTF8to16(const UTF8String& text, UnicodeErrorCode* error, unsigned int* length) {
  const unsigned char* s = text.data();
  const unsigned char* const end = s + text.size();
  // Sized once from the lead bytes; no other memory is taken, whatever the input's size.
  UTF16String result(detail::CountUTF16Units(s, end), UTF16Char{0});
  UTF16Char* out = result.data();
  UTF16Char* const outEnd = out + result.size();

  UnicodeErrorCode code = kUnicodeNoError;
  while (s < end && code == kUnicodeNoError) {
    detail::WidenAsciiRun(s, end, out, outEnd);
    code = DecodeNonAsciiRun(s, end, out, outEnd);
  }

  result.resize(static_cast<std::size_t>(out - result.data()));
  if (error != nullptr) *error = code;
  if (length != nullptr) *length = static_cast<unsigned int>(result.size());
  return result;
}

UTF16String AsciiToUTF16(const char* text, unsigned int count) {
  UTF16String result;
  if (text == nullptr) return result;
  result.resize(count);
  for (unsigned int i = 0; i < count; ++i) {
    // Sign extension: bytes 80-FF become FF80-FFFF.
    result[i] =
        static_cast<UTF16Char>(static_cast<std::int16_t>(static_cast<signed char>(text[i])));
  }
  return result;
}

int GetUTF8ByteCount(const unsigned char* text, int characters) {
  if (text == nullptr || characters == 0) return 0;
  int bytes = 0;
  for (int walked = 0; characters < 0 || walked < characters; ++walked) {
    const unsigned lead = text[bytes];
    if (lead == 0) break;
    const unsigned length = TrailingBytes(lead) + 1;
    if (length > 4) return -1;
    // The walk never steps over the terminating NUL of a truncated last sequence.
    for (unsigned i = 1; i < length; ++i) {
      if (text[bytes + static_cast<int>(i)] == 0) return bytes + static_cast<int>(i);
    }
    bytes += static_cast<int>(length);
  }
  return bytes;
}

int GetUTF8CharacterCount(const unsigned char* text, int bytes) {
  if (text == nullptr || bytes < 1) return 0;
  int count = 0;
  int position = 0;
  while (position < bytes) {
    const unsigned lead = text[position];
    if (lead == 0) return count;
    const int length = static_cast<int>(TrailingBytes(lead)) + 1;
    if (length > 4) return -1;
    ++count;
    // Bytes inside the limit are checked for a NUL that ends the text early; bytes past
    // the limit are not read.
    for (int i = 1; i < length && position + i < bytes; ++i) {
      if (text[position + i] == 0) return count;
    }
    position += length;
  }
  return count;
}

int UTF16StrLen(const UTF16Char* text) {
  if (text == nullptr) return 0;
  return static_cast<int>(std::char_traits<UTF16Char>::length(text));
}

UnicodeSurrogateT UnicodeSurrogate(UTF16Char unit) {
  if (IsHighSurrogate(unit)) return kHighSurrogate;
  if (IsLowSurrogate(unit)) return kLowSurrogate;
  return kNotSurrogate;
}

}  // namespace kelcore::utility
