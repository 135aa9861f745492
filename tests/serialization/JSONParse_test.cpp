#include <kelcore/serialization/JSONParse.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <stdexcept>
#include <string>

#include "JSONTestSupport.h"

namespace kelcore::serialization {
namespace {

using namespace testing;

template <class T>
T As(const JSONValue& value) {
  EXPECT_TRUE(value);
  if (!value) return T();
  const T* held = boost::any_cast<T>(value.get());
  EXPECT_NE(held, nullptr) << "held type " << value->type().name();
  return held ? *held : T();
}

TEST(JSONParse, EmptyAndWhiteTextGiveNoValue) {
  EXPECT_FALSE(Parse(""));
  EXPECT_FALSE(Parse(" \t\r\n\v\f"));
  EXPECT_FALSE(JSONParse(static_cast<const unsigned char*>(nullptr)));
  EXPECT_FALSE(JSONParse(nullptr, 0));
  EXPECT_FALSE(JSONParse(UTF16String()));
}

// Integers keep 64 bits; a zero fraction and exponent still make an integer.
TEST(JSONParse, IntegerClassification) {
  const std::pair<std::string, std::uint64_t> unsignedCases[] = {
      {" 42 ", 42},
      {"2.0", 2},
      {"1e0", 1},
      {"7.000e000", 7},
      {"0", 0},
      {"18446744073709551615", std::numeric_limits<std::uint64_t>::max()},
      // Digits that do not fit are dropped, not scaled.
      {"184467440737095516159", std::numeric_limits<std::uint64_t>::max()},
      {"99999999999999999999999", 9999999999999999999u},
      // Stray signs set the exponent's sign only; they do not end the number.
      {"1-2", 12},
  };
  for (const auto& [text, value] : unsignedCases)
    EXPECT_EQ(As<std::uint64_t>(Parse(text)), value) << text;

  const std::pair<std::string, std::int64_t> signedCases[] = {
      {"-7", -7},
      {"-0", 0},
      {"-", 0},
      {"-3.0e0", -3},
      {"-9223372036854775808", std::numeric_limits<std::int64_t>::min()},
      {"-9223372036854775809", -922337203685477580},
  };
  for (const auto& [text, value] : signedCases)
    EXPECT_EQ(As<std::int64_t>(Parse(text)), value) << text;
}

TEST(JSONParse, DoubleClassification) {
  const std::pair<std::string, double> cases[] = {
      {"1.5e2", 150},
      {"1.5E+2", 150},
      {"-0.25", -0.25},
      {"0.1", 0.1},
      {"1e5", 100000},
      {"2.5e-3", 0.0025},
      {"3.14159265358979323846", 3.14159265358979323846},
      {"0.123456789012345678901234", 0.123456789012345678901234},  // digits past 64 bits dropped
      {"1.5.2", 1.2},  // a later point restarts the fraction
      {"1e-5+", 1e5},  // the last sign wins
      {"1e+-5", 1e-5},
      {"-.5", -0.5},
      {"123456789012345678901234.5", 12345678901234567890.5},
      {"1e400", std::numeric_limits<double>::infinity()},
      {"-1e400", -std::numeric_limits<double>::infinity()},
      {"0." + std::string(54, '0') + "1e5", 1e-50},
  };
  for (const auto& [text, value] : cases) EXPECT_EQ(As<double>(Parse(text)), value) << text;
  EXPECT_EQ(As<double>(Parse("1e-400")), 0.0);
  EXPECT_TRUE(std::signbit(As<double>(Parse("-1e-400"))));
}

TEST(JSONParse, StringsAndEscapes) {
  const std::pair<std::string, std::string> cases[] = {
      {R"("plain")", "plain"},
      {R"("")", ""},
      {R"("a\"b\\c\/d")", "a\"b\\c/d"},
      {R"("\b\f\n\r\t")", "\b\f\n\r\t"},
      // \u gives the decimal digits of the code, surrogates included.
      {R"("\u0041")", "65"},
      {R"("x\uFFFFy")", "x65535y"},
      {R"("\ud800\uDC00")", "5529656320"},
      {R"("\u0000")", "0"},
      // Raw bytes are copied: UTF-8, invalid UTF-8, control bytes, NUL.
      {"\"caf\xC3\xA9 \xFF\x01\n\"", "caf\xC3\xA9 \xFF\x01\n"},
      {std::string("\"a\0b\"", 5), std::string("a\0b", 3)},
  };
  for (const auto& [text, value] : cases)
    EXPECT_EQ(Narrow(As<UTF8String>(Parse(text))), value) << text;
}

TEST(JSONParse, LiteralsMatchOverTheirLengthOnly) {
  EXPECT_TRUE(As<bool>(Parse("true")));
  EXPECT_TRUE(As<bool>(Parse("trueish")));
  EXPECT_FALSE(As<bool>(Parse(" false ")));
  EXPECT_TRUE(boost::any_cast<NullType>(Parse("null").get()) != nullptr);
  EXPECT_TRUE(boost::any_cast<NullType>(Parse("nullx").get()) != nullptr);
}

TEST(JSONParse, TrailingTextIsIgnored) {
  EXPECT_EQ(As<std::uint64_t>(Parse("1 2")), 1u);
  EXPECT_EQ(Rewrite("[1] }garbage"), "[1]");
  EXPECT_EQ(Rewrite("{}{"), "{}");
}

TEST(JSONParse, ContainersAndDuplicateKeys) {
  EXPECT_EQ(Rewrite(" { \"b\" : [ 1 , -2 , true , null , { } , [ ] ] , \"a\" : \"x\" } "),
            R"({"a":"x","b":[1,-2,true,null,{},[]]})");
  // The last of repeated keys wins.
  EXPECT_EQ(Rewrite(R"({"k":1,"j":0,"k":2})"), R"({"j":0,"k":2})");
}

// Each of the six messages, exactly.
TEST(JSONParse, ErrorMessages) {
  const std::pair<std::string, std::string> cases[] = {
      {"x", "ParseValue unexpected char"},
      {"+1", "ParseValue unexpected char"},
      {"[1,]", "ParseValue unexpected char"},
      {"[,1]", "ParseValue unexpected char"},
      {"tru", "ParsePrimitive unexpected char"},
      {"nul", "ParsePrimitive unexpected char"},
      {"fals e", "ParsePrimitive unexpected char"},
      {R"("a\x")", "AdvanceString: unexpected char"},
      {R"("abc)", "AdvanceString: unexpected char"},
      {R"("abc\)", "AdvanceString: unexpected char"},
      {R"("abc\")", "AdvanceString: unexpected char"},
      {R"("\u12")", "EscapeString: unexpected char"},
      {R"("\u12G4")", "EscapeString: unexpected char"},
      {R"("\u\"abc")", "EscapeString: unexpected char"},
      {"[1 2]", "ParseArray unexpected char"},
      {"[1", "ParseArray unexpected char"},
      {"[", "ParseArray unexpected char"},
      {"{\"a\":1 \"b\":2}", "ParseObject unexpected char"},
      {"{\"a\" 1}", "ParseObject unexpected char"},
      {"{a:1}", "ParseObject unexpected char"},
      {"{\"a\":1,}", "ParseObject unexpected char"},
      {"{\"a\":", "ParseObject unexpected char"},
      {"{", "ParseObject unexpected char"},
  };
  for (const auto& [text, message] : cases) EXPECT_EQ(ParseError(text), message) << text;
}

TEST(JSONParse, Overloads) {
  const std::string text = R"({"k":[1,"v"]})";
  const auto* bytes = reinterpret_cast<const unsigned char*>(text.c_str());
  const std::string expected = text;
  EXPECT_EQ(Write(*JSONParse(U8(text))), expected);
  EXPECT_EQ(Write(*JSONParse(bytes)), expected);
  EXPECT_EQ(Write(*JSONParse(bytes, text.size())), expected);
  EXPECT_EQ(Write(*JSONParse(UTF16String(u"{\"k\":[1,\"v\"]}"))), expected);
  // The counted form stops at its count; the NUL-terminated one at the NUL.
  EXPECT_EQ(As<std::uint64_t>(JSONParse(bytes + 6, 1)), 1u);
  EXPECT_EQ(ParseError(std::string("[1\0]", 4)), "ParseArray unexpected char");
  EXPECT_EQ(Narrow(As<UTF8String>(JSONParse(UTF16String(u"\"\u00E9\"")))), "\xC3\xA9");
}

TEST(JSONParse, NestingLimit) {
  const std::size_t limit = kMaxJSONDepth;
  EXPECT_NO_THROW(Parse(std::string(limit, '[') + std::string(limit, ']')));
  EXPECT_THROW(Parse(std::string(limit + 1, '[') + std::string(limit + 1, ']')),
               std::overflow_error);
  EXPECT_THROW(Parse(std::string(limit + 1, '{')), std::runtime_error);
  std::string mixed;
  for (std::size_t i = 0; i <= limit; ++i) mixed += "{\"a\":[";
  EXPECT_THROW(Parse(mixed), std::overflow_error);
}

}  // namespace
}  // namespace kelcore::serialization
