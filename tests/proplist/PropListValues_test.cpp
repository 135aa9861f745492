#include "PropListTestSupport.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <list>
#include <tuple>
#include <type_traits>

namespace kelcore::proplist {
namespace {

const UTF8String kKey = U8("k");

template <class T>
struct Sample {
  PropListPropertyType type;
  T value;
  T sentinel;  // what a getter's output holds before the call
};

template <class T>
T AfterHit(const T&, const T& value) {
  return value;
}
template <class E>
std::list<E> AfterHit(const std::list<E>& sentinel, const std::list<E>& value) {
  std::list<E> appended = sentinel;
  appended.insert(appended.end(), value.begin(), value.end());
  return appended;
}

template <class T>
using Limits = std::numeric_limits<T>;

// One value of each of the twenty types, the arrays holding each type's extremes.
const auto kSamples = std::make_tuple(
    Sample<UTF16String>{kPropTypeUnicodeString, UTF16String{u'h', u'\u00E9', char16_t(0xD800)},
                        U16(u"s")},
    Sample<UTF8String>{kPropTypeString, U8(std::string_view("\xFF\0x", 3)), U8("s")},
    Sample<bool>{kPropTypeBool, true, false}, Sample<std::uint16_t>{kPropTypeUInt16, 65535, 7},
    Sample<std::uint32_t>{kPropTypeUInt32, 4294967295u, 7},
    Sample<std::int32_t>{kPropTypeInt32, Limits<std::int32_t>::min(), 7},
    Sample<std::int64_t>{kPropTypeInt64, Limits<std::int64_t>::min(), 7},
    Sample<std::uint64_t>{kPropTypeUInt64, Limits<std::uint64_t>::max(), 7},
    Sample<float>{kPropTypeFloat, Limits<float>::denorm_min(), 7},
    Sample<double>{kPropTypeDouble, -Limits<double>::max(), 7},
    Sample<std::list<UTF16String>>{kPropTypeUnicodeStringArray, {U16(u""), U16(u"\u4E2D")}, {}},
    Sample<std::list<UTF8String>>{kPropTypeStringArray, {U8("a"), U8("")}, {U8("s")}},
    Sample<std::list<bool>>{kPropTypeBoolArray, {false, true, false}, {true}},
    Sample<std::list<std::uint16_t>>{kPropTypeUInt16Array, {0, 65535}, {7}},
    Sample<std::list<std::uint32_t>>{kPropTypeUInt32Array, {0, 4294967295u}, {7}},
    Sample<std::list<std::int32_t>>{
        kPropTypeInt32Array, {Limits<std::int32_t>::min(), Limits<std::int32_t>::max()}, {7}},
    Sample<std::list<std::int64_t>>{
        kPropTypeInt64Array, {Limits<std::int64_t>::min(), Limits<std::int64_t>::max()}, {7}},
    Sample<std::list<std::uint64_t>>{kPropTypeUInt64Array, {Limits<std::uint64_t>::max()}, {7}},
    Sample<std::list<float>>{kPropTypeFloatArray, {Limits<float>::lowest(), 0.1f}, {7}},
    Sample<std::list<double>>{kPropTypeDoubleArray, {Limits<double>::infinity(), 0.1}, {7}});

template <class S, class G>
void ExpectRead(const PropList& list, const S& stored, const G& asked) {
  auto out = asked.sentinel;
  const bool hit = stored.type == asked.type;
  EXPECT_EQ(list.GetValue(kKey, out), hit) << "type " << stored.type << " read as " << asked.type;
  if constexpr (std::is_same_v<decltype(out), decltype(stored.value)>) {
    if (hit) {
      EXPECT_EQ(out, AfterHit(asked.sentinel, stored.value)) << "type " << stored.type;
    }
  }
  if (!hit) {
    EXPECT_EQ(out, asked.sentinel) << "type " << stored.type << " read as " << asked.type;
  }
}

// Every type replaces the one before under the same key; each reads back only as its own
// type (array getters appending), and every other getter misses and leaves its output.
TEST(PropListValues, EachTypeReadsBackOnlyAsItself) {
  PropList list;
  std::apply(
      [&](const auto&... stored) {
        (
            [&](const auto& sample) {
              list.SetValue(kKey, sample.value);
              EXPECT_EQ(list.GetPropertyCount(), 1u);
              EXPECT_EQ(list.GetPropertyType(kKey), sample.type);
              std::apply([&](const auto&... asked) { (ExpectRead(list, sample, asked), ...); },
                         kSamples);
            }(stored),
            ...);
      },
      kSamples);
}

template <class V>
concept Settable = requires(PropList& list, const V& value) {
  list.SetValue(kKey, value);
};
static_assert(Settable<std::int64_t> && Settable<std::list<bool>> && Settable<UTF16String>);
// A pointer would store a bool; a long long that is not std::int64_t has no single width.
static_assert(!Settable<const char*> && !Settable<const char16_t*>);
static_assert(std::is_same_v<long long, std::int64_t> || !Settable<long long>);

// An array set over an array of its type replaces the elements; it does not append.
TEST(PropListValues, SettingAnArrayReplacesItsElements) {
  PropList list;
  list.SetValue(kKey, std::list<std::int32_t>{1, 2, 3});
  list.SetValue(kKey, std::list<std::int32_t>{4});
  std::list<std::int32_t> values;
  ASSERT_TRUE(list.GetValue(kKey, values));
  EXPECT_EQ(values, std::list<std::int32_t>{4});
  list.SetValue(kKey, std::list<std::int32_t>{});
  EXPECT_EQ(list.GetPropertyType(kKey), kPropTypeInt32Array);
  EXPECT_TRUE(list.GetValue(kKey, values));
  EXPECT_EQ(values.size(), 1u);
}

// Data of format version 1 kept numbers as text.
TEST(PropListValues, VersionOneReadsDoublesFromText) {
  struct Case {
    std::u16string text;
    double expected;
  };
  const Case cases[] = {
      {u"2.5", 2.5}, {u" -7e2", -700}, {u"12abc", 12}, {u"abc", 0}, {u"", 99}, {u"  ", 99},
  };
  for (const Case& c : cases) {
    PropList list;
    list.SetValue(kKey, U16(c.text));
    double value = 99;
    EXPECT_FALSE(list.GetValue(kKey, value));
    list.SetVersion(1);
    const PropList copy = list;
    EXPECT_TRUE(copy.GetValue(kKey, value));
    EXPECT_EQ(value, c.expected) << std::string(c.text.begin(), c.text.end());
  }

  PropList list;
  list.SetVersion(1);
  list.SetValue(kKey, U8("2.5"));
  float single = 1;
  double value = 1;
  EXPECT_FALSE(list.GetValue(kKey, value));
  list.SetValue(kKey, U16(u"2.5"));
  EXPECT_FALSE(list.GetValue(kKey, single));
  list.SetValue(kKey, 3.0);
  EXPECT_TRUE(list.GetValue(kKey, value));
  EXPECT_EQ(value, 3.0);
}

}  // namespace
}  // namespace kelcore::proplist
