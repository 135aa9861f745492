#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {

// Out-of-line destructors anchor each class's type information in the library, so that
// a host catches them by class across the library boundary.
byte_stream_exception::~byte_stream_exception() = default;
eof_error::~eof_error() = default;
io_error::~io_error() = default;
value_width_error::~value_width_error() = default;

const char* value_width_error::what() const noexcept {
  return "value does not fit its fixed-width field in the byte stream";
}

}  // namespace kelcore::filesupport
