// Typed serialisation over byte streams, and the stream-to-stream copy.
//
// The layout is fixed and identical on every platform. Integers are big-endian (most
// significant byte first), one Put/Get per byte:
//
//   char, signed char, unsigned char   1 byte
//   bool                               1 byte: 1 true, 0 false; reading: non-zero is true
//   boost::logic::tribool              1 byte: 0 false, 1 true, 2 indeterminate; reading:
//                                      any byte above 2 is taken as indeterminate
//   short, unsigned short, UTF16Char   2 bytes
//   unsigned int, long, unsigned long  4 bytes
//   long long, unsigned long long      8 bytes
//   std::string, UTF8String            64-bit length n, then the n bytes unchanged
//   UTF16String                        64-bit length n in code units, then each unit as 2
//                                      bytes (not converted)
//   float, double, long double         decimal text in the std::string layout: the
//                                      classic-locale general notation with 36 significant
//                                      digits ("%.36g"), e.g. 0.5 is "0.5"
//
// `long` and `unsigned long` are 64-bit on some platforms but their field is 32 bits:
// inserting a value outside [-2^31, 2^31 - 1] (or above 2^32 - 1) raises
// value_width_error and writes nothing. Extraction sign- or zero-extends. There is no
// overload for plain int (use unsigned int or long).
//
// Reading: the extractors let eof_error (or any other error of the stream) pass and the
// stream stays where the failing Get left it; a number read part way leaves its target
// unchanged, a string keeps the characters read so far.
// Strings are cleared first and then filled one Get per byte; the length is not checked
// against what the stream holds, so a corrupt length reads until the stream raises (or
// until the string is full: std::length_error "string too long").
// Floating point text that does not parse as a number of the target type (or is out of
// its range) leaves the target unchanged and raises nothing; "inf", "-inf" and "nan",
// which the writer produces for such values, read back as such. 36 digits restore every
// bit of a float or double; a long double is written with the same 36 digits, so the
// text written from a double reads back exactly into a long double and vice versa.
//
// Each operator returns its stream so that calls chain.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>

#include <boost/logic/tribool.hpp>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

// The fixed-width fields (every integer type, bool, tribool) are inline. When the stream's
// window (ByteStream.h) holds the whole field, the operator loads or stores it there and
// moves the pointer; otherwise it calls the out-of-line half below, which takes the bytes
// that are in the window and makes one Get/Put call for each of the others. Either way the
// result, the stream's state and the exceptions are those of one Get/Put per byte.
namespace detail {

// The `width`-byte big-endian field (1 <= width <= 8) moved byte by byte as described
// above; GetFieldAcrossArea returns it zero-extended, PutFieldAcrossArea writes the low
// `width` bytes of `field`. A width outside [1, 8] raises std::invalid_argument.
KELCORE_API std::uint64_t GetFieldAcrossArea(IByteStream& in, std::size_t width);
KELCORE_API void PutFieldAcrossArea(OByteStream& out, std::uint64_t field, std::size_t width);

// Byte-wise expressions that do not depend on the host's byte order; compilers turn them
// into one load or store and a byte swap.
template <std::size_t... I>
constexpr std::uint64_t LoadBigEndian(const unsigned char* bytes,
                                      std::index_sequence<I...>) noexcept {
  constexpr std::size_t kLast = sizeof...(I) - 1;
  return ((std::uint64_t{bytes[I]} << (8 * (kLast - I))) | ...);
}

template <std::size_t... I>
constexpr void StoreBigEndian(unsigned char* bytes, std::uint64_t field,
                              std::index_sequence<I...>) noexcept {
  constexpr std::size_t kLast = sizeof...(I) - 1;
  ((bytes[I] = static_cast<unsigned char>(field >> (8 * (kLast - I)))), ...);
}

template <std::size_t Width>
std::uint64_t GetField(IByteStream& in) {
  if (const unsigned char* bytes = in.TakeFromGetArea(Width)) {
    return LoadBigEndian(bytes, std::make_index_sequence<Width>());
  }
  return GetFieldAcrossArea(in, Width);
}

template <std::size_t Width>
void PutField(OByteStream& out, std::uint64_t field) {
  if (unsigned char* slots = out.TakeFromPutArea(Width)) {
    StoreBigEndian(slots, field, std::make_index_sequence<Width>());
  } else {
    PutFieldAcrossArea(out, field, Width);
  }
}

// Where long is wider than its 32-bit field, values outside the field are refused.
inline void CheckLongWidth(long value) {
  if constexpr (sizeof(long) > 4) {
    if (value < INT32_MIN || value > INT32_MAX) throw value_width_error();
  }
}

inline void CheckLongWidth(unsigned long value) {
  if constexpr (sizeof(unsigned long) > 4) {
    if (value > UINT32_MAX) throw value_width_error();
  }
}

}  // namespace detail

inline OByteStream& operator<<(OByteStream& out, char value) {
  detail::PutField<1>(out, static_cast<unsigned char>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, signed char value) {
  detail::PutField<1>(out, static_cast<unsigned char>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, unsigned char value) {
  detail::PutField<1>(out, value);
  return out;
}
inline OByteStream& operator<<(OByteStream& out, bool value) {
  detail::PutField<1>(out, value ? 1 : 0);
  return out;
}
inline OByteStream& operator<<(OByteStream& out, boost::logic::tribool value) {
  detail::PutField<1>(out, static_cast<unsigned char>(value.value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, short value) {
  detail::PutField<2>(out, static_cast<std::uint16_t>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, unsigned short value) {
  detail::PutField<2>(out, value);
  return out;
}
inline OByteStream& operator<<(OByteStream& out, UTF16Char value) {
  detail::PutField<2>(out, static_cast<std::uint16_t>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, unsigned int value) {
  static_assert(sizeof(unsigned int) == 4, "unsigned int is the 32-bit field");
  detail::PutField<4>(out, value);
  return out;
}
inline OByteStream& operator<<(OByteStream& out, long value) {
  detail::CheckLongWidth(value);
  detail::PutField<4>(out, static_cast<std::uint32_t>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, unsigned long value) {
  detail::CheckLongWidth(value);
  detail::PutField<4>(out, value);
  return out;
}
inline OByteStream& operator<<(OByteStream& out, long long value) {
  detail::PutField<8>(out, static_cast<std::uint64_t>(value));
  return out;
}
inline OByteStream& operator<<(OByteStream& out, unsigned long long value) {
  detail::PutField<8>(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, int value) = delete;

inline IByteStream& operator>>(IByteStream& in, char& value) {
  value = static_cast<char>(detail::GetField<1>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, signed char& value) {
  value = static_cast<signed char>(detail::GetField<1>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, unsigned char& value) {
  value = static_cast<unsigned char>(detail::GetField<1>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, bool& value) {
  value = detail::GetField<1>(in) != 0;
  return in;
}
inline IByteStream& operator>>(IByteStream& in, boost::logic::tribool& value) {
  switch (detail::GetField<1>(in)) {
    case 0:
      value = false;
      break;
    case 1:
      value = true;
      break;
    default:
      value = boost::logic::indeterminate;
      break;
  }
  return in;
}
inline IByteStream& operator>>(IByteStream& in, short& value) {
  value = static_cast<short>(detail::GetField<2>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, unsigned short& value) {
  value = static_cast<unsigned short>(detail::GetField<2>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, UTF16Char& value) {
  value = static_cast<UTF16Char>(detail::GetField<2>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, unsigned int& value) {
  value = static_cast<unsigned int>(detail::GetField<4>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, long& value) {
  value = static_cast<std::int32_t>(detail::GetField<4>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, unsigned long& value) {
  value = static_cast<std::uint32_t>(detail::GetField<4>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, long long& value) {
  value = static_cast<long long>(detail::GetField<8>(in));
  return in;
}
inline IByteStream& operator>>(IByteStream& in, unsigned long long& value) {
  value = detail::GetField<8>(in);
  return in;
}
IByteStream& operator>>(IByteStream& in, int& value) = delete;

KELCORE_API OByteStream& operator<<(OByteStream& out, const std::string& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, const UTF8String& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, const UTF16String& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, float value);
KELCORE_API OByteStream& operator<<(OByteStream& out, double value);
KELCORE_API OByteStream& operator<<(OByteStream& out, long double value);

KELCORE_API IByteStream& operator>>(IByteStream& in, std::string& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, UTF8String& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, UTF16String& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, float& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, double& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, long double& value);

// Copies `in` into `out` from the input's current position, one Get and one Put per byte.
// When in.Length() is 0 (unknown) it copies until the input raises eof_error, which ends
// the copy normally. Otherwise it copies exactly Length() bytes, so an input that is not
// at position 0 runs past its end and the eof_error reaches the caller. Every other
// exception reaches the caller.
KELCORE_API OByteStream& operator<<(OByteStream& out, IByteStream& in);

}  // namespace kelcore::filesupport
