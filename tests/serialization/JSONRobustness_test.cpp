// Hostile input must either parse or raise the reader's exceptions; trees must survive
// writing and reading back.
#include <kelcore/serialization/JSONAccess.h>
#include <kelcore/serialization/JSONParse.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include "JSONTestSupport.h"

namespace kelcore::serialization {
namespace {

using namespace testing;

// Parses a private heap copy of exactly the given bytes, so that a sanitizer catches any
// read past them. Returns false when the reader refused the text.
bool ParsesOrRefuses(const std::string& text) {
  const std::vector<unsigned char> bytes(text.begin(), text.end());
  try {
    JSONParse(bytes.data(), bytes.size());
    return true;
  } catch (const std::runtime_error&) {  // std::overflow_error included
    return false;
  }
}

const std::string kSample =
    "{\"settings\":{\"volume\":0.75,\"muted\":false,\"name\":\"Caf\xC3\xA9 \\\"A\\\"\\n\","
    "\"ids\":[1,-2,18446744073709551615,1e5,2.5E-3],\"none\":null,\"u\":\"\\u00e9\\/\"},"
    "\"messages\":[{\"text\":\"hi\\tthere\\\\\",\"at\":-9223372036854775808,\"read\":true},"
    "{},[],[[{\"deep\":[null]}]]]}  ";

TEST(JSONRobustness, EveryTruncationAndMutationOfASample) {
  ASSERT_TRUE(ParsesOrRefuses(kSample));
  for (std::size_t length = 0; length <= kSample.size(); ++length) {
    ParsesOrRefuses(kSample.substr(0, length));
  }
  const char replacements[] = {'"', '\\', '[',    ']', '{', '}', ',',
                               ':', '\0', '\xFF', 'u', '-', 'e'};
  for (std::size_t i = 0; i < kSample.size(); ++i) {
    for (char replacement : replacements) {
      std::string mutated = kSample;
      mutated[i] = replacement;
      ParsesOrRefuses(mutated);
      ParsesOrRefuses(mutated.substr(0, i + 1));
    }
  }
}

TEST(JSONRobustness, HostileCorpus) {
  const std::string hugeDigits(100000, '9');
  const std::string cases[] = {
      "\"\xC0\x80\xED\xA0\x80\xF4\x90\x80\x80\xFF\xFE\"",  // invalid UTF-8 is carried raw
      "\"\\uD800\"",
      "\"\\uDFFF\\uD800\"",
      "\"\\u\"",
      "\"\\uFFF\"",
      "\"\\u0",
      std::string("\0", 1),
      std::string("[\0]", 3),
      std::string("\"\0\"", 3),
      std::string("{\"\0\":\0}", 7),
      hugeDigits,
      "-" + hugeDigits,
      "0." + hugeDigits,
      "1e" + hugeDigits,
      "1e-" + hugeDigits,
      hugeDigits + "." + hugeDigits + "e-" + hugeDigits,
      "0." + std::string(100000, '0') + "1e99999",
      "-.e-",
      "--",
      "-e",
      "1.e",
      std::string(100000, '{'),
      std::string(100000, ']'),
      std::string(100000, '"'),
      std::string(100000, '\\'),
      "\"" + std::string(99999, '\\'),
  };
  for (const auto& text : cases) ParsesOrRefuses(text);
  EXPECT_EQ(Narrow(*boost::any_cast<UTF8String>(Parse(cases[0]).get())), cases[0].substr(1, 11));
  EXPECT_EQ(*boost::any_cast<std::uint64_t>(Parse(hugeDigits).get()), 9999999999999999999u);
}

TEST(JSONRobustness, DeepNestingRaisesInsteadOfOverflowingTheStack) {
  EXPECT_THROW(Parse(std::string(100000, '[')), std::overflow_error);
  std::string objects;
  for (int i = 0; i < 100000; ++i) objects += "{\"a\":";
  EXPECT_THROW(Parse(objects), std::overflow_error);
}

TEST(JSONRobustness, RandomBytes) {
  const char alphabet[] = "[]{}\",:\\/0123456789.eE+-tfnrulasbu \n\x01\x80\xFF";
  std::mt19937 random(7);
  for (int i = 0; i < 3000; ++i) {
    std::string text(random() % 40, ' ');
    for (auto& c : text) c = alphabet[random() % (sizeof alphabet - 1)];
    ParsesOrRefuses(text);
  }
}

// Structural equality of two values.
bool Same(const JSONValue& a, const JSONValue& b);
bool Same(const boost::any& a, const boost::any& b) {
  if (a.type() != b.type()) return false;
  if (const auto* x = boost::any_cast<JSONObject>(&a)) {
    const auto& y = *boost::any_cast<JSONObject>(&b);
    if (x->size() != y.size()) return false;
    for (auto i = x->begin(), j = y.begin(); i != x->end(); ++i, ++j) {
      if (i->first != j->first || !Same(i->second, j->second)) return false;
    }
    return true;
  }
  if (const auto* x = boost::any_cast<JSONArray>(&a)) {
    const auto& y = *boost::any_cast<JSONArray>(&b);
    if (x->size() != y.size()) return false;
    for (std::size_t i = 0; i < x->size(); ++i) {
      if (!Same((*x)[i], y[i])) return false;
    }
    return true;
  }
  if (const auto* x = boost::any_cast<UTF8String>(&a))
    return *x == *boost::any_cast<UTF8String>(&b);
  if (const auto* x = boost::any_cast<std::uint64_t>(&a))
    return *x == *boost::any_cast<std::uint64_t>(&b);
  if (const auto* x = boost::any_cast<std::int64_t>(&a))
    return *x == *boost::any_cast<std::int64_t>(&b);
  if (const auto* x = boost::any_cast<bool>(&a)) return *x == *boost::any_cast<bool>(&b);
  return boost::any_cast<NullType>(&a) != nullptr;
}
bool Same(const JSONValue& a, const JSONValue& b) {
  return a && b && Same(*a, *b);
}

class TreeMaker {
 public:
  explicit TreeMaker(unsigned seed) : random_(seed) {}

  JSONValue Make(int depth) {
    switch (random_() % (depth < 6 ? 8 : 6)) {
      case 0:
        return MakeJSONValue(Bytes(1));  // no NUL: strings are written up to one
      case 1:
        return MakeJSONValue(std::uint64_t{random_()} << (random_() % 40));
      case 2:  // only negative integers are signed
        return MakeJSONValue(-1 - static_cast<std::int64_t>(random_() % 1000000007u));
      case 3:
        return MakeJSONValue(random_() % 2 == 0);
      case 4:
        return MakeJSONValue(G_NullType);
      case 5:
        return MakeJSONValue(Bytes(1) + U8(" \t\"\\\b\f\n\r/"));
      case 6: {
        JSONValue array = MakeJSONValue(JSONArray());
        for (unsigned n = random_() % 5; n > 0; --n) AppendToArray(*array, Make(depth + 1));
        return array;
      }
      default: {
        JSONValue object = MakeJSONValue(JSONObject());
        for (unsigned n = random_() % 5; n > 0; --n) {
          UTF8String key = Bytes(0);
          std::erase_if(key, [](unsigned char c) { return c == '"' || c == '\\'; });
          AddToObject(*object, key, Make(depth + 1));  // keys are written unescaped
        }
        return object;
      }
    }
  }

 private:
  // Random bytes, never below `lowest`.
  UTF8String Bytes(unsigned lowest) {
    UTF8String text(random_() % 12, ' ');
    for (auto& c : text) c = static_cast<unsigned char>(lowest + random_() % (256 - lowest));
    return text;
  }

  std::mt19937 random_;
};

TEST(JSONRobustness, RandomTreesSurviveWritingAndReading) {
  TreeMaker maker(11);
  for (int i = 0; i < 400; ++i) {
    const JSONValue tree = maker.Make(0);
    const UTF8String text = GetJSONUTF8String(*tree);
    const JSONValue back = JSONParse(text);
    ASSERT_TRUE(Same(tree, back)) << Narrow(text);
  }
}

}  // namespace
}  // namespace kelcore::serialization
