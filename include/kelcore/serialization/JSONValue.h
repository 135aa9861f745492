// The JSON value tree: what each JSON construct holds, and how values are made.
//
// A value is a boost::shared_ptr<boost::any>; an empty pointer means "no value" (what
// JSONParse returns for an empty text). The any holds exactly one of:
//   object  JSONObject (ordered by the keys' bytes; keys are unique)
//   array   JSONArray
//   string  UTF8String (any bytes, NULs included; not validated)
//   integer std::uint64_t when not negative, std::int64_t when negative
//   number with a non-zero fraction or exponent: double
//   true / false  bool
//   null    NullType (the writer writes it as null)
// Containers hold further values by shared pointer, so a subtree may be shared between
// trees. The library's own values are made with MakeJSONValue (one small-block block
// for the pointer's control block and the any).
//
// Threads: reference counts are thread-safe; the containers are not locked. A tree may
// be read by several threads at once, but must not be modified while anyone reads it.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/SmallBlockAllocator.h>
#include <kelcore/utility/StringTypes.h>

#include <boost/any.hpp>
#include <boost/make_shared.hpp>
#include <boost/shared_ptr.hpp>

#include <cstddef>
#include <utility>

namespace kelcore::serialization {

using JSONValue = boost::shared_ptr<boost::any>;
using JSONObject = utility::SmallBlockAllocator::map<UTF8String, JSONValue>;
using JSONArray = utility::SmallBlockAllocator::vector<JSONValue>;

// The marker a JSON null holds. All instances are equal.
struct NullType {
  friend bool operator==(NullType, NullType) noexcept { return true; }
};
KELCORE_API extern const NullType G_NullType;

// Deepest nesting of objects and arrays that JSONParse accepts and the writer writes: a
// document nested deeper (the outermost container is level 1) is refused with
// std::overflow_error rather than exhausting the stack. A tree nested deeper, or one that
// contains itself, is refused by the writer in the same way.
inline constexpr std::size_t kMaxJSONDepth = 512;

// A new value holding `content` (moved in when given as an rvalue). Throws
// std::bad_alloc when out of memory.
template <class T>
JSONValue MakeJSONValue(T&& content) {
  return boost::allocate_shared<boost::any>(
      utility::SmallBlockAllocator::STLAllocator<boost::any>(), std::forward<T>(content));
}

}  // namespace kelcore::serialization
