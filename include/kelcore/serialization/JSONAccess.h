// Building and querying value trees (see <kelcore/serialization/JSONValue.h>).
//
// Preconditions: AddToObject needs an any holding a JSONObject, AppendToArray one
// holding a JSONArray; anything else throws std::invalid_argument and changes nothing.
// Lookups that miss return an empty pointer or false, never throw.
//
// A value given as `const boost::any&` is copied into a new value (a container's copy
// shares its children); a JSONValue is shared as it is (an empty pointer is stored as
// is and written like an empty any).
//
// Not locked: a tree must not be modified while another thread reads it.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/serialization/JSONValue.h>
#include <kelcore/utility/StringTypes.h>

#include <boost/any.hpp>

#include <string>

namespace kelcore::serialization {

// Sets `key` to `value`. A key already present is REPLACED (its old value is released),
// the same rule the parser applies to duplicate keys.
KELCORE_API void AddToObject(boost::any& object, const UTF8String& key, JSONValue value);
KELCORE_API void AddToObject(boost::any& object, const UTF8String& key, const boost::any& value);
KELCORE_API void AddToObject(boost::any& object, const std::string& key, JSONValue value);
KELCORE_API void AddToObject(boost::any& object, const std::string& key, const boost::any& value);
// The key is converted to UTF-8.
KELCORE_API void AddToObject(boost::any& object, const UTF16String& key, JSONValue value);
KELCORE_API void AddToObject(boost::any& object, const UTF16String& key, const boost::any& value);
// `key` is NUL-terminated and must not be null.
KELCORE_API void AddToObject(boost::any& object, const char* key, JSONValue value);
KELCORE_API void AddToObject(boost::any& object, const char* key, const boost::any& value);

// Appends `value` at the end.
KELCORE_API void AppendToArray(boost::any& array, JSONValue value);
KELCORE_API void AppendToArray(boost::any& array, const boost::any& value);

// The value stored under `key` (NUL-terminated, must not be null), or an empty pointer
// when the key is absent or `object` is empty or does not hold a JSONObject.
KELCORE_API JSONValue GetVariantInObject(const JSONValue& object, const char* key);
KELCORE_API JSONValue GetVariantInObject(const JSONObject& object, const char* key);

// Whether GetVariantInObject finds a non-empty value (a stored null counts).
KELCORE_API bool ObjectHasProperty(const JSONValue& object, const char* key);
KELCORE_API bool ObjectHasProperty(const JSONObject& object, const char* key);

// A new object {"method": method as a UTF8String, "params": a copy of params}. `method`
// must not be null.
KELCORE_API JSONValue BuildCall(const char* method, const boost::any& params);

}  // namespace kelcore::serialization
