// HashValue: a 96-bit running digest, and MixHash, which feeds data into it.
//
// Each mixing call runs Bob Jenkins' 1996 "lookup2" hash over the given bytes, seeded
// with the value's first word, and then mixes that result with the value's other two
// words; the three mixed words become the new value. A HashValue therefore digests the
// whole sequence of calls: feeding "ab" then "c" gives another value than feeding
// "abc" once. Values are identical on every platform and byte order (multi-byte data is
// hashed in little-endian order), so they may be stored.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <compare>
#include <cstddef>
#include <cstdint>
#include <iosfwd>
#include <string>

namespace kelcore::utility {

struct HashValue {
  std::uint32_t words[3] = {0, 0, 0};

  friend bool operator==(const HashValue&, const HashValue&) = default;
  friend auto operator<=>(const HashValue&, const HashValue&) = default;
};

// Writes the three words as unsigned numbers separated by single spaces, in the
// stream's current base ("1 2 3" by default).
KELCORE_API std::ostream& operator<<(std::ostream& stream, const HashValue& value);

// Reads three unsigned numbers separated by white space, in the stream's current base,
// as operator<< writes them. When any is missing or does not fit 32 bits the stream's
// failbit is set and `value` is left unchanged.
KELCORE_API std::istream& operator>>(std::istream& stream, HashValue& value);

// The mixing operations. Thread safety: none needed, every call works only on the
// HashValue it is given.
class KELCORE_API MixHash {
 public:
  // Raw bytes. Throws std::length_error beyond 2^32-1 bytes (one call hashes at most
  // that many). `data` may be null when `size` is 0.
  static void MixInBytes(HashValue& value, const void* data, std::size_t size);
  // The code units, as little-endian 16-bit values.
  static void MixIn(HashValue& value, const UTF16String& text);
  static void MixIn(HashValue& value, const UTF8String& text);
  static void MixIn(HashValue& value, const std::string& text);
  // The number as 4 or 8 little-endian bytes.
  static void MixIn(HashValue& value, std::uint32_t number);
  static void MixIn(HashValue& value, std::uint64_t number);

 private:
  // lookup2 over `length` bytes, then the mixing into the value's words. Whole 12-byte
  // blocks are read as three words straight from memory when `data` is 4-byte aligned
  // on a little-endian machine, and assembled byte by byte otherwise; both give the
  // same result.
  static void MixInData(HashValue& value, const unsigned char* data, unsigned int length);
};

}  // namespace kelcore::utility
