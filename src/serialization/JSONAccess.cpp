// Building and looking up objects and arrays.
#include <kelcore/serialization/JSONAccess.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <cstring>
#include <stdexcept>

namespace kelcore::serialization {
namespace {

JSONObject& ObjectOf(boost::any& object) {
  auto* map = boost::any_cast<JSONObject>(&object);
  if (map == nullptr) throw std::invalid_argument("AddToObject: the value is not a JSON object");
  return *map;
}

UTF8String ToUTF8(const char* key) {
  const auto* bytes = reinterpret_cast<const unsigned char*>(key);
  return UTF8String(bytes, std::strlen(key));
}

}  // namespace

void AddToObject(boost::any& object, const UTF8String& key, JSONValue value) {
  ObjectOf(object).insert_or_assign(key, std::move(value));
}
void AddToObject(boost::any& object, const UTF8String& key, const boost::any& value) {
  JSONObject& map = ObjectOf(object);
  map.insert_or_assign(key, MakeJSONValue(value));
}
void AddToObject(boost::any& object, const std::string& key, JSONValue value) {
  AddToObject(object, UTF8String(key.begin(), key.end()), std::move(value));
}
void AddToObject(boost::any& object, const std::string& key, const boost::any& value) {
  AddToObject(object, UTF8String(key.begin(), key.end()), value);
}
void AddToObject(boost::any& object, const UTF16String& key, JSONValue value) {
  AddToObject(object, utility::UTF16to8(key), std::move(value));
}
void AddToObject(boost::any& object, const UTF16String& key, const boost::any& value) {
  AddToObject(object, utility::UTF16to8(key), value);
}
void AddToObject(boost::any& object, const char* key, JSONValue value) {
  AddToObject(object, ToUTF8(key), std::move(value));
}
void AddToObject(boost::any& object, const char* key, const boost::any& value) {
  AddToObject(object, ToUTF8(key), value);
}

void AppendToArray(boost::any& array, JSONValue value) {
  auto* vector = boost::any_cast<JSONArray>(&array);
  if (vector == nullptr)
    throw std::invalid_argument("AppendToArray: the value is not a JSON array");
  vector->push_back(std::move(value));
}
void AppendToArray(boost::any& array, const boost::any& value) {
  auto* vector = boost::any_cast<JSONArray>(&array);
  if (vector == nullptr)
    throw std::invalid_argument("AppendToArray: the value is not a JSON array");
  vector->push_back(MakeJSONValue(value));
}

JSONValue GetVariantInObject(const JSONObject& object, const char* key) {
  const auto found = object.find(ToUTF8(key));
  return found == object.end() ? JSONValue() : found->second;
}
JSONValue GetVariantInObject(const JSONValue& object, const char* key) {
  const auto* map = object ? boost::any_cast<JSONObject>(object.get()) : nullptr;
  return map == nullptr ? JSONValue() : GetVariantInObject(*map, key);
}

bool ObjectHasProperty(const JSONObject& object, const char* key) {
  return GetVariantInObject(object, key) != nullptr;
}
bool ObjectHasProperty(const JSONValue& object, const char* key) {
  return GetVariantInObject(object, key) != nullptr;
}

JSONValue BuildCall(const char* method, const boost::any& params) {
  JSONObject call;
  call.emplace(ToUTF8("method"), MakeJSONValue(ToUTF8(method)));
  call.emplace(ToUTF8("params"), MakeJSONValue(params));
  return MakeJSONValue(std::move(call));
}

}  // namespace kelcore::serialization
