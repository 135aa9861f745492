// The exceptions that byte streams raise.
//
// byte_stream_exception is the root of the family. Its subclasses eof_error and io_error
// carry no data and keep std::exception's what(); callers catch them by class. They are
// plain standard-library style exceptions, not the library's localized errors.
// value_width_error is raised by the typed insertion operators when a value does not fit
// the fixed width it has in the serialised form (on platforms where a C++ type is wider
// than its wire field); nothing is written in that case.
#pragma once

#include <exception>

#include <kelcore/Export.h>

namespace kelcore::filesupport {

class KELCORE_API byte_stream_exception : public std::exception {
 public:
  byte_stream_exception() noexcept = default;
  byte_stream_exception(const byte_stream_exception&) noexcept = default;
  byte_stream_exception& operator=(const byte_stream_exception&) noexcept = default;
  ~byte_stream_exception() override;
};

// A read past the end of an input, or a write past the end of a fixed-size output.
class KELCORE_API eof_error : public byte_stream_exception {
 public:
  ~eof_error() override;
};

// The operating system refused a read, write, seek, flush, truncate or size query.
class KELCORE_API io_error : public byte_stream_exception {
 public:
  ~io_error() override;
};

// A value handed to a typed insertion operator is outside the range of its fixed-width
// field in the serialised form (for example a 64-bit `long` above 2^31 - 1, whose field is
// 32 bits). what() names the problem.
class KELCORE_API value_width_error : public byte_stream_exception {
 public:
  ~value_width_error() override;
  const char* what() const noexcept override;
};

}  // namespace kelcore::filesupport
