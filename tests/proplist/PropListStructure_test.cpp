#include "PropListTestSupport.h"

#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <functional>
#include <limits>
#include <list>
#include <string>
#include <utility>
#include <vector>

namespace kelcore::proplist {
namespace {

std::list<UTF8String> Names(const PropList& list) {
  std::list<UTF8String> names{U8("stale")};
  list.GetPropertyNames(names);
  return names;
}

// Keys are whole byte strings: order is unsigned byte order, nothing is folded or split,
// and a key ends at its first NUL.
TEST(PropListStructure, KeysAreBytesUpToTheFirstNul) {
  PropList list;
  const char* keys[] = {"B",
                        "a",
                        "A",
                        "\xC3\xA9",
                        "",
                        "a b",
                        "a/b",
                        "Key",
                        "key",
                        "<&>'\"",
                        "\xE6\x97\xA5\xE6\x9C\xAC",
                        "\xFF\xFE"};
  std::int32_t n = 0;
  for (const char* key : keys) list.SetValue(U8(key), n++);
  const std::list<UTF8String> expected = {U8(""),
                                          U8("<&>'\""),
                                          U8("A"),
                                          U8("B"),
                                          U8("Key"),
                                          U8("a"),
                                          U8("a b"),
                                          U8("a/b"),
                                          U8("key"),
                                          U8("\xC3\xA9"),
                                          U8("\xE6\x97\xA5\xE6\x9C\xAC"),
                                          U8("\xFF\xFE")};
  EXPECT_EQ(Names(list), expected);
  n = 0;
  for (const char* key : keys) {
    std::int32_t value = -1;
    EXPECT_TRUE(list.GetValue(U8(key), value)) << key;
    EXPECT_EQ(value, n++) << key;
  }
  EXPECT_EQ(list.GetPropertyType(U8("a/")), kPropTypeNone);

  list.SetValue(U8(std::string_view("ab\0cd", 5)), true);
  bool flag = false;
  EXPECT_TRUE(list.GetValue(U8("ab"), flag));
  EXPECT_TRUE(list.GetValue(U8(std::string_view("ab\0zz", 5)), flag));
  EXPECT_TRUE(list.RemoveValue(U8(std::string_view("ab\0", 3))));
  EXPECT_FALSE(list.RemoveValue(U8("ab")));
}

TEST(PropListStructure, SubListsAreFoundKeptAndReplaced) {
  PropList list;
  list.SetVersion(1);
  list.SetValue(U8("n"), 1);
  EXPECT_EQ(list.GetSubList(U8("n")), nullptr);
  EXPECT_EQ(list.GetSubList(U8("none")), nullptr);
  EXPECT_EQ(list.GetSubList(static_cast<const unsigned char*>(nullptr)), nullptr);

  PropList* sub = list.NewSubList(U8("n"));  // replaces the int32
  ASSERT_NE(sub, nullptr);
  EXPECT_EQ(list.GetPropertyType(U8("n")), kPropTypePropList);
  EXPECT_EQ(sub->GetVersion(), 4);
  sub->SetValue(U8("inner"), 2.5);
  for (int i = 0; i < 100; ++i) list.SetValue(U8("k" + std::to_string(i)), i);
  EXPECT_EQ(list.NewSubList(U8("n")), sub);
  EXPECT_EQ(list.GetSubList(U8("n")), sub);
  EXPECT_EQ(std::as_const(list).GetSubList(reinterpret_cast<const unsigned char*>("n")), sub);
  double inner = 0;
  EXPECT_TRUE(list.GetSubList(U8("n"))->GetValue(U8("inner"), inner));
  EXPECT_EQ(inner, 2.5);

  list.SetValue(U8("n"), U8("text"));
  EXPECT_EQ(list.GetSubList(U8("n")), nullptr);
  EXPECT_EQ(list.GetPropertyType(U8("n")), kPropTypeString);
}

TEST(PropListStructure, RemoveClearAndIteration) {
  PropList list;
  list.SetVersion(2);
  list.SetValue(U8("b"), std::list<bool>{});
  list.NewSubList(U8("a"));
  list.SetValue(U8("c"), std::uint16_t(3));
  std::vector<std::pair<UTF8String, PropListPropertyType>> seen;
  for (const PropList::Property entry : list) seen.emplace_back(entry.key, entry.type);
  const std::vector<std::pair<UTF8String, PropListPropertyType>> expected = {
      {U8("a"), kPropTypePropList}, {U8("b"), kPropTypeBoolArray}, {U8("c"), kPropTypeUInt16}};
  EXPECT_EQ(seen, expected);

  EXPECT_TRUE(list.RemoveValue(U8("b")));
  EXPECT_FALSE(list.RemoveValue(U8("b")));
  EXPECT_EQ(list.GetPropertyCount(), 2u);
  list.Clear();
  EXPECT_TRUE(list.IsEmpty());
  EXPECT_EQ(list.begin(), list.end());
  EXPECT_EQ(list.GetVersion(), 2);
  EXPECT_EQ(Names(list), std::list<UTF8String>{});
}

PropList MakeTree() {
  PropList tree;
  tree.SetVersion(3);
  tree.SetValue(U8("array"), std::list<UTF16String>{U16(u"x"), U16(u"y")});
  PropList* nested = tree.NewSubList(U8("nested"));
  nested->SetValue(U8("d"), std::list<double>{1.5});
  nested->NewSubList(U8("deeper"))->SetValue(U8("s"), U8("deep"));
  return tree;
}

// A copy, however made, shares nothing with its source.
TEST(PropListStructure, CopiesAreDeepAndIndependent) {
  const PropList original = MakeTree();
  PropList constructed(original);
  PropList assigned;
  assigned.SetValue(U8("old"), 1);
  assigned = original;
  for (PropList* copy : {&constructed, &assigned}) {
    EXPECT_EQ(*copy, original);
    EXPECT_EQ(copy->GetVersion(), 3);
    EXPECT_NE(copy->GetSubList(U8("nested")), original.GetSubList(U8("nested")));
    copy->SetValue(U8("array"), std::list<UTF16String>{U16(u"changed")});
    PropList* nested = copy->GetSubList(U8("nested"));
    nested->SetValue(U8("d"), std::list<double>{});
    nested->GetSubList(U8("deeper"))->SetValue(U8("s"), U8("changed"));
    EXPECT_NE(*copy, original);
  }
  EXPECT_EQ(original, MakeTree());

  const PropList& self = assigned;
  assigned = self;  // self-assignment keeps the contents
  EXPECT_EQ(assigned, constructed);
  PropList moved(std::move(assigned));
  EXPECT_EQ(moved, constructed);
  EXPECT_TRUE(assigned.IsEmpty());  // NOLINT: the moved-from state is specified
  EXPECT_EQ(assigned.GetVersion(), 4);
}

// Equality is by keys, types and values; floats by bit pattern; the version is ignored.
TEST(PropListStructure, EqualityComparesTypesAndBitPatterns) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double otherNan = std::bit_cast<double>(std::bit_cast<std::uint64_t>(nan) | 1);
  struct Case {
    const char* what;
    std::function<void(PropList&)> fillA;
    std::function<void(PropList&)> fillB;
    bool equal;
  };
  const Case cases[] = {
      {"same NaN", [&](PropList& l) { l.SetValue(U8("x"), nan); },
       [&](PropList& l) { l.SetValue(U8("x"), nan); }, true},
      {"NaN payloads", [&](PropList& l) { l.SetValue(U8("x"), nan); },
       [&](PropList& l) { l.SetValue(U8("x"), otherNan); }, false},
      {"signed zero", [](PropList& l) { l.SetValue(U8("x"), std::list<float>{0.0f}); },
       [](PropList& l) { l.SetValue(U8("x"), std::list<float>{-0.0f}); }, false},
      {"int32 vs uint32", [](PropList& l) { l.SetValue(U8("x"), 5); },
       [](PropList& l) { l.SetValue(U8("x"), 5u); }, false},
      {"key", [](PropList& l) { l.SetValue(U8("x"), 5); },
       [](PropList& l) { l.SetValue(U8("y"), 5); }, false},
      {"extra key", [](PropList& l) { l.SetValue(U8("x"), 5); },
       [](PropList& l) {
         l.SetValue(U8("x"), 5);
         l.SetValue(U8("y"), 5);
       },
       false},
      {"version", [](PropList& l) { l.SetVersion(1); }, [](PropList&) {}, true},
      {"empty arrays", [](PropList& l) { l.SetValue(U8("x"), std::list<bool>{}); },
       [](PropList& l) { l.SetValue(U8("x"), std::list<UTF8String>{}); }, false},
      {"nested", [](PropList& l) { l.NewSubList(U8("x"))->SetValue(U8("y"), true); },
       [](PropList& l) { l.NewSubList(U8("x"))->SetValue(U8("y"), false); }, false},
  };
  for (const Case& c : cases) {
    PropList left, right;
    c.fillA(left);
    c.fillB(right);
    EXPECT_EQ(left == right, c.equal) << c.what;
    EXPECT_EQ(right == left, c.equal) << c.what;
  }
}

}  // namespace
}  // namespace kelcore::proplist
