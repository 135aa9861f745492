// Writing a value tree as compact JSON text: no spaces or line breaks anywhere.
//
// By held type:
//   JSONObject     {"key":value,...} in key byte order; the key bytes are written as
//                  they are, NOT escaped (a key holding '"' or '\' gives text that does
//                  not read back)
//   JSONArray      [value,...]
//   std::int64_t   printf "%lli";  std::uint64_t  printf "%llu"
//   double         printf "%1.*lg" with precision 17 (infinity and NaN come out as
//                  inf / nan, which JSON readers refuse)
//   UTF8String     quoted, up to its first NUL byte; bytes 8, 9, 10, 12, 13, '"' and
//                  '\' as \b \t \n \f \r \" \\, every other byte raw (no \u escapes)
//   bool           true / false
//   NullType       null
//   empty any      nothing at all (so an array element or member value is left blank)
//   anything else  <ERROR>
// An empty pointer inside a container is written like an empty any. A tree nested deeper
// than kMaxJSONDepth, or one that contains itself, throws std::overflow_error.
//
// Thread-safe as long as nobody modifies the tree meanwhile.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <boost/any.hpp>

namespace kelcore::serialization {

KELCORE_API UTF8String GetJSONUTF8String(const boost::any& value);
// The same text converted to UTF-16. Conversion stops at the first byte sequence that is
// not UTF-8 (raw bytes in strings or keys), as UTF8to16 does.
KELCORE_API UTF16String GetJSONString(const boost::any& value);

}  // namespace kelcore::serialization
