#include <kelcore/serialization/JSONAccess.h>
#include <kelcore/serialization/JSONWriter.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <limits>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include "JSONTestSupport.h"

namespace kelcore::serialization {
namespace {

using namespace testing;

TEST(JSONWriter, ScalarsByHeldType) {
  EXPECT_EQ(Write(boost::any(std::int64_t{-42})), "-42");
  EXPECT_EQ(Write(boost::any(std::numeric_limits<std::int64_t>::min())), "-9223372036854775808");
  EXPECT_EQ(Write(boost::any(std::numeric_limits<std::uint64_t>::max())), "18446744073709551615");
  EXPECT_EQ(Write(boost::any(0.1)), "0.10000000000000001");
  EXPECT_EQ(Write(boost::any(150.0)), "150");
  EXPECT_EQ(Write(boost::any(1e300)), "1.0000000000000001e+300");
  EXPECT_EQ(Write(boost::any(std::numeric_limits<double>::infinity())), "inf");
  EXPECT_EQ(Write(boost::any(true)), "true");
  EXPECT_EQ(Write(boost::any(false)), "false");
  EXPECT_EQ(Write(boost::any(G_NullType)), "null");
  EXPECT_EQ(Write(boost::any()), "");
  // Types outside the tree's vocabulary, plain int and std::string included.
  EXPECT_EQ(Write(boost::any(7)), "<ERROR>");
  EXPECT_EQ(Write(boost::any(std::string("s"))), "<ERROR>");
}

// Doubles come out exactly as printf "%1.*lg" with precision 17 writes them.
TEST(JSONWriter, DoublesMatchPrintf) {
  std::mt19937_64 random(17);
  for (int i = 0; i < 2000; ++i) {
    const std::uint64_t bits = random();
    double value;
    std::memcpy(&value, &bits, sizeof value);
    if (std::isnan(value)) continue;
    char expected[512];
    std::snprintf(expected, sizeof expected, "%1.*lg", 17, value);
    ASSERT_EQ(Write(boost::any(value)), expected);
  }
  // Ordinary magnitudes, where the writer has its own digit generation; the last two
  // have an 18th digit of exactly 5 (ties round to even).
  std::uniform_real_distribution<double> exponent(-4, 16);
  std::vector<double> values = {1e-3,
                                0.1,
                                0.01,
                                0.3,
                                1,
                                9.999999999999999e14,
                                150,
                                1e15,
                                100000000000000.125,
                                100000000000000.375};
  for (int i = 0; i < 20000; ++i) values.push_back(std::pow(10.0, exponent(random)));
  for (double value : values) {
    for (double sign : {1.0, -1.0}) {
      char expected[512];
      std::snprintf(expected, sizeof expected, "%1.*lg", 17, sign * value);
      ASSERT_EQ(Write(boost::any(sign * value)), expected);
    }
  }
}

TEST(JSONWriter, StringEscapes) {
  const std::pair<std::string, std::string> cases[] = {
      {"a\nb", R"("a\nb")"},
      {"\b\t\n\f\r", R"("\b\t\n\f\r")"},
      {"q\"s\\/", R"("q\"s\\/")"},
      {"\x01\x1F\x7F\xC3\xA9\xFF", "\"\x01\x1F\x7F\xC3\xA9\xFF\""},  // raw, never \u
      {std::string("ab\0cd", 5), R"("ab")"},                         // ends at NUL
  };
  for (const auto& [text, json] : cases) EXPECT_EQ(Write(boost::any(U8(text))), json);
}

TEST(JSONWriter, ContainersInKeyOrderWithRawKeys) {
  boost::any object = JSONObject();
  AddToObject(object, "b", boost::any(std::uint64_t{1}));
  AddToObject(object, "a", boost::any(JSONArray()));
  AddToObject(object, "k\"ey", boost::any(true));  // keys are not escaped
  AddToObject(object, "\xC3\xA9", boost::any(std::int64_t{-1}));
  EXPECT_EQ(Write(object), "{\"a\":[],\"b\":1,\"k\"ey\":true,\"\xC3\xA9\":-1}");

  boost::any array = JSONArray();
  AppendToArray(array, boost::any(U8("x")));
  AppendToArray(array, JSONValue());  // an empty pointer writes nothing
  AppendToArray(array, boost::any());
  AppendToArray(array, boost::any(2.5));
  EXPECT_EQ(Write(array), R"(["x",,,2.5])");
}

TEST(JSONWriter, UTF16Form) {
  EXPECT_EQ(GetJSONString(*Parse("[\"\xC3\xA9\"]")), UTF16String(u"[\"\u00E9\"]"));
}

TEST(JSONWriter, DepthLimitAndCycles) {
  JSONValue root = MakeJSONValue(JSONArray());
  JSONValue inner = root;
  for (std::size_t i = 1; i < kMaxJSONDepth; ++i) {
    JSONValue next = MakeJSONValue(JSONArray());
    AppendToArray(*inner, next);
    inner = next;
  }
  EXPECT_EQ(Write(*root).size(), 2 * kMaxJSONDepth);
  AppendToArray(*inner, MakeJSONValue(JSONArray()));
  EXPECT_THROW(Write(*root), std::overflow_error);

  JSONValue cycle = MakeJSONValue(JSONObject());
  AddToObject(*cycle, "self", cycle);
  EXPECT_THROW(Write(*cycle), std::overflow_error);
  boost::any_cast<JSONObject&>(*cycle).clear();  // break the cycle so it is freed
}

}  // namespace
}  // namespace kelcore::serialization
