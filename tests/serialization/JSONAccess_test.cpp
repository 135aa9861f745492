#include <kelcore/serialization/JSONAccess.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <stdexcept>
#include <string>

#include "JSONTestSupport.h"

namespace kelcore::serialization {
namespace {

using namespace testing;

// Every key form lands under the same UTF-8 key, and an existing key is replaced.
TEST(JSONAccess, AddToObjectKeyFormsReplace) {
  boost::any object = JSONObject();
  AddToObject(object, "k", boost::any(std::uint64_t{1}));
  AddToObject(object, std::string("k"), boost::any(std::uint64_t{2}));
  EXPECT_EQ(Write(object), R"({"k":2})");
  AddToObject(object, U8("k"), MakeJSONValue(std::uint64_t{3}));
  AddToObject(object, UTF16String(u"\u00E9"), boost::any(true));
  EXPECT_EQ(Write(object), "{\"k\":3,\"\xC3\xA9\":true}");
}

TEST(JSONAccess, ValuesAreCopiedOrShared) {
  boost::any object = JSONObject();
  boost::any array = JSONArray();
  const JSONValue shared = MakeJSONValue(std::uint64_t{1});
  AddToObject(object, "shared", shared);
  AddToObject(object, "copied", *shared);
  AppendToArray(array, shared);
  AppendToArray(array, *shared);
  *shared = std::uint64_t{9};
  EXPECT_EQ(Write(object), R"({"copied":1,"shared":9})");
  EXPECT_EQ(Write(array), "[9,1]");
}

TEST(JSONAccess, WrongContainerThrowsAndChangesNothing) {
  boost::any notObject = JSONArray();
  boost::any notArray = JSONObject();
  EXPECT_THROW(AddToObject(notObject, "k", boost::any(true)), std::invalid_argument);
  EXPECT_THROW(AppendToArray(notArray, boost::any(true)), std::invalid_argument);
  boost::any empty;
  EXPECT_THROW(AppendToArray(empty, JSONValue()), std::invalid_argument);
  EXPECT_EQ(Write(notObject), "[]");
  EXPECT_EQ(Write(notArray), "{}");
}

TEST(JSONAccess, Lookups) {
  const JSONValue root = Parse(R"({"a":1,"n":null,"o":{"b":"x"}})");
  EXPECT_EQ(Write(*GetVariantInObject(root, "o")), R"({"b":"x"})");
  EXPECT_TRUE(ObjectHasProperty(root, "n"));   // a stored null counts
  EXPECT_FALSE(ObjectHasProperty(root, "b"));  // not searched recursively
  EXPECT_FALSE(GetVariantInObject(root, "missing"));
  EXPECT_FALSE(GetVariantInObject(Parse("[1]"), "a"));
  EXPECT_FALSE(GetVariantInObject(JSONValue(), "a"));
  const auto& map = *boost::any_cast<JSONObject>(root.get());
  EXPECT_TRUE(ObjectHasProperty(map, "a"));
  EXPECT_FALSE(ObjectHasProperty(map, ""));
}

TEST(JSONAccess, BuildCall) {
  EXPECT_EQ(Write(*BuildCall("m", boost::any(std::uint64_t{5}))), R"({"method":"m","params":5})");
  const JSONValue params = Parse(R"({"x":[true]})");
  const JSONValue call = BuildCall("open", *params);
  EXPECT_EQ(Write(*call), R"({"method":"open","params":{"x":[true]}})");
  EXPECT_NE(GetVariantInObject(call, "params").get(), params.get());
}

}  // namespace
}  // namespace kelcore::serialization
