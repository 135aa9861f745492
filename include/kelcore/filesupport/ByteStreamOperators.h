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

#include <string>

#include <boost/logic/tribool.hpp>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

KELCORE_API OByteStream& operator<<(OByteStream& out, char value);
KELCORE_API OByteStream& operator<<(OByteStream& out, signed char value);
KELCORE_API OByteStream& operator<<(OByteStream& out, unsigned char value);
KELCORE_API OByteStream& operator<<(OByteStream& out, bool value);
KELCORE_API OByteStream& operator<<(OByteStream& out, boost::logic::tribool value);
KELCORE_API OByteStream& operator<<(OByteStream& out, short value);
KELCORE_API OByteStream& operator<<(OByteStream& out, unsigned short value);
KELCORE_API OByteStream& operator<<(OByteStream& out, UTF16Char value);
KELCORE_API OByteStream& operator<<(OByteStream& out, unsigned int value);
KELCORE_API OByteStream& operator<<(OByteStream& out, long value);
KELCORE_API OByteStream& operator<<(OByteStream& out, unsigned long value);
KELCORE_API OByteStream& operator<<(OByteStream& out, long long value);
KELCORE_API OByteStream& operator<<(OByteStream& out, unsigned long long value);
KELCORE_API OByteStream& operator<<(OByteStream& out, const std::string& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, const UTF8String& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, const UTF16String& value);
KELCORE_API OByteStream& operator<<(OByteStream& out, float value);
KELCORE_API OByteStream& operator<<(OByteStream& out, double value);
KELCORE_API OByteStream& operator<<(OByteStream& out, long double value);
OByteStream& operator<<(OByteStream& out, int value) = delete;

KELCORE_API IByteStream& operator>>(IByteStream& in, char& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, signed char& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, unsigned char& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, bool& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, boost::logic::tribool& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, short& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, unsigned short& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, UTF16Char& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, unsigned int& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, long& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, unsigned long& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, long long& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, unsigned long long& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, std::string& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, UTF8String& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, UTF16String& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, float& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, double& value);
KELCORE_API IByteStream& operator>>(IByteStream& in, long double& value);
IByteStream& operator>>(IByteStream& in, int& value) = delete;

// Copies `in` into `out` from the input's current position, one Get and one Put per byte.
// When in.Length() is 0 (unknown) it copies until the input raises eof_error, which ends
// the copy normally. Otherwise it copies exactly Length() bytes, so an input that is not
// at position 0 runs past its end and the eof_error reaches the caller. Every other
// exception reaches the caller.
KELCORE_API OByteStream& operator<<(OByteStream& out, IByteStream& in);

}  // namespace kelcore::filesupport
