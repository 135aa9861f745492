#include <kelcore/utility/ImmutableString.h>

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>
#include <vector>

namespace {

using kelcore::UTF16String;
using kelcore::UTF8String;
using kelcore::utility::ImmutableString;

const unsigned char* U(const char* text) {
  return reinterpret_cast<const unsigned char*>(text);
}

int Sign(int value) {
  return (value > 0) - (value < 0);
}

// Texts unique to one test, so that tests sharing the process-wide table stay apart.
std::string Unique(const char* stem) {
  static std::atomic<int> counter{0};
  return std::string(stem) + "#" + std::to_string(counter.fetch_add(1));
}

TEST(ImmutableStringTest, EqualTextsShareOneRepresentationWhateverTheArgumentType) {
  const std::string text = Unique("shared");
  const ImmutableString a = ImmutableString::CreateDynamic(text);
  const ImmutableString b = ImmutableString::CreateDynamic(text.c_str());
  const ImmutableString c = ImmutableString::CreateDynamic(UTF16String(text.begin(), text.end()));
  const ImmutableString d = ImmutableString::CreateDynamic(U(text.c_str()), text.size());
  ASSERT_NE(a.GetInternalRepresentation(), nullptr);
  EXPECT_EQ(a.GetInternalRepresentation(), b.GetInternalRepresentation());
  EXPECT_EQ(a.GetInternalRepresentation(), c.GetInternalRepresentation());
  EXPECT_EQ(a.GetInternalRepresentation(), d.GetInternalRepresentation());
  EXPECT_EQ(a.GetInternalRepresentation()->referenceCount.load(), 4u);
  EXPECT_EQ(std::string(a.CStr()), text);
  EXPECT_EQ(a.Length(), text.size());
  EXPECT_EQ(a.Compare(b), 0);
}

TEST(ImmutableStringTest, StaticTextStaysStaticAndUncounted) {
  static const std::string literal = Unique("literal");
  const ImmutableString s = ImmutableString::CreateStatic(literal.c_str());
  const ImmutableString d = ImmutableString::CreateDynamic(literal);
  ImmutableString copy = d;
  ASSERT_NE(s.GetInternalRepresentation(), nullptr);
  EXPECT_EQ(s.GetInternalRepresentation(), d.GetInternalRepresentation());
  EXPECT_FALSE(s.GetInternalRepresentation()->dynamic);
  EXPECT_EQ(s.Data(), reinterpret_cast<const unsigned char*>(literal.c_str()));
  EXPECT_EQ(s.GetInternalRepresentation()->referenceCount.load(), 0u);

  // And a text first made dynamic stays counted.
  const std::string other = Unique("dyn-first");
  const ImmutableString first = ImmutableString::CreateDynamic(other);
  const ImmutableString second = ImmutableString::CreateStatic(other.c_str());
  EXPECT_EQ(first.GetInternalRepresentation(), second.GetInternalRepresentation());
  EXPECT_TRUE(second.GetInternalRepresentation()->dynamic);
  EXPECT_EQ(second.GetInternalRepresentation()->referenceCount.load(), 2u);
}

TEST(ImmutableStringTest, CopyMoveAndAssignKeepTheCount) {
  ImmutableString a = ImmutableString::CreateDynamic(Unique("count"));
  auto* rep = a.GetInternalRepresentation();
  {
    ImmutableString b = a;
    ImmutableString c;
    c = b;
    EXPECT_EQ(rep->referenceCount.load(), 3u);
    ImmutableString d = std::move(c);
    EXPECT_TRUE(c.IsEmpty());
    EXPECT_EQ(c.GetInternalRepresentation(), nullptr);
    EXPECT_EQ(rep->referenceCount.load(), 3u);
    d = d;
    EXPECT_EQ(rep->referenceCount.load(), 3u);
  }
  EXPECT_EQ(rep->referenceCount.load(), 1u);
}

// Purging frees only what nobody holds; revived texts survive; nothing is freed twice.
TEST(ImmutableStringTest, PurgeFreesUnusedAndKeepsRevived) {
  ImmutableString::PurgeUnusedStrings();
  const std::string gone = Unique("gone");
  const std::string revived = Unique("revived");
  ImmutableString::CreateDynamic(gone);
  const auto* revivedRep = ImmutableString::CreateDynamic(revived).GetInternalRepresentation();
  // Expire, revive, expire and revive again: the text must be on the expired list once.
  ImmutableString again = ImmutableString::CreateDynamic(revived);
  EXPECT_EQ(again.GetInternalRepresentation(), revivedRep);
  again = ImmutableString();
  again = ImmutableString::CreateDynamic(revived);
  EXPECT_EQ(again.GetInternalRepresentation(), revivedRep);

  EXPECT_TRUE(ImmutableString::PurgeUnusedStrings());
  EXPECT_FALSE(ImmutableString::PurgeUnusedStrings());
  EXPECT_EQ(ImmutableString::CreateDynamic(revived).GetInternalRepresentation(), revivedRep);
  EXPECT_EQ(again.Compare(revived.c_str()), 0);

  again = ImmutableString();
  EXPECT_TRUE(ImmutableString::PurgeUnusedStrings());
  EXPECT_FALSE(ImmutableString::PurgeUnusedStrings());
  // Static texts are never purged.
  static const char kStatic[] = "immutable-string-test-static";
  const auto* staticRep = ImmutableString::CreateStatic(kStatic).GetInternalRepresentation();
  EXPECT_FALSE(ImmutableString::PurgeUnusedStrings());
  EXPECT_EQ(ImmutableString::CreateStatic(kStatic).GetInternalRepresentation(), staticRep);
}

TEST(ImmutableStringTest, EmptyAndNullTexts) {
  for (const ImmutableString& empty :
       {ImmutableString::CreateDynamic(""), ImmutableString::CreateDynamic(std::string()),
        ImmutableString::CreateDynamic(static_cast<const char*>(nullptr)),
        ImmutableString::CreateStatic(""), ImmutableString::CreateDynamic(UTF16String())}) {
    EXPECT_EQ(empty.GetInternalRepresentation(), nullptr);
    EXPECT_TRUE(empty.ToString().empty());
    EXPECT_STREQ(empty.CStr(), "");
    EXPECT_EQ(empty.Compare(ImmutableString()), 0);
    EXPECT_EQ(empty.Compare(""), 0);
    EXPECT_EQ(empty.Compare(static_cast<const char*>(nullptr)), 0);
    EXPECT_LT(empty.Compare("a"), 0);
    EXPECT_LT(empty.Compare(ImmutableString::CreateDynamic("a")), 0);
    EXPECT_GT(ImmutableString::CreateDynamic("a").Compare(empty), 0);
  }
}

// Compare against every argument type: (handle text, argument, expected sign).
TEST(ImmutableStringTest, CompareOverloads) {
  struct Case {
    const char* text;
    const char* other;
    int sign;
  };
  const Case cases[] = {
      {"abc", "abc", 0}, {"abc", "abd", -1}, {"abd", "abc", 1}, {"ab", "abc", -1},
      {"abc", "ab", 1},  {"abc", "", 1},     {"B", "a", -1},    {"\xC3\xA9", "z", 1},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.text) + " vs " + c.other);
    const ImmutableString s = ImmutableString::CreateDynamic(c.text);
    const std::string other = c.other;
    EXPECT_EQ(Sign(s.Compare(other)), c.sign);
    EXPECT_EQ(Sign(s.Compare(c.other)), c.sign);
    EXPECT_EQ(Sign(s.Compare(U(c.other))), c.sign);
    EXPECT_EQ(Sign(s.Compare(UTF8String(U(c.other)))), c.sign);
    EXPECT_EQ(Sign(s.Compare(ImmutableString::CreateDynamic(c.other))), c.sign);
  }
  // UTF-16 arguments are converted first: U+00E9 is C3 A9.
  const ImmutableString e = ImmutableString::CreateDynamic("\xC3\xA9");
  EXPECT_EQ(e.Compare(UTF16String(1, u'\u00E9')), 0);
  EXPECT_EQ(e.Compare(u"\u00E9"), 0);
  EXPECT_EQ(e.ToString(), UTF16String(1, u'\u00E9'));
  // Narrow arguments are measured up to their NUL; so is a std::string.
  EXPECT_EQ(ImmutableString::CreateDynamic("ab").Compare(std::string("ab\0cd", 5)), 0);
}

TEST(ImmutableStringTest, EmbeddedNulTextsAreDistinctButCompareEqual) {
  const ImmutableString a = ImmutableString::CreateDynamic(U("x\0a"), 3);
  const ImmutableString b = ImmutableString::CreateDynamic(U("x\0b"), 3);
  EXPECT_NE(a.GetInternalRepresentation(), b.GetInternalRepresentation());
  EXPECT_EQ(a.Compare(b), 0);
  EXPECT_EQ(a.Length(), 3u);
  EXPECT_EQ(a.ToString(), UTF16String(u"x"));
}

// Many texts per bucket: the live map grows and survives removals in any order.
TEST(ImmutableStringTest, ManyTextsInternAndPurge) {
  std::vector<std::string> texts;
  std::vector<ImmutableString> held;
  for (int i = 0; i < 3000; ++i) texts.push_back(Unique("many"));
  for (const std::string& text : texts) held.push_back(ImmutableString::CreateDynamic(text));
  for (std::size_t i = 0; i < held.size(); i += 2) held[i] = ImmutableString();
  EXPECT_TRUE(ImmutableString::PurgeUnusedStrings());
  for (std::size_t i = 0; i < texts.size(); ++i) {
    const ImmutableString again = ImmutableString::CreateDynamic(texts[i]);
    EXPECT_EQ(again.Compare(texts[i]), 0);
    if (i % 2 == 1) {
      EXPECT_EQ(again.GetInternalRepresentation(), held[i].GetInternalRepresentation());
    }
  }
}

// Creation, copies, drops and purges on several threads over a few shared texts, so that
// texts keep expiring and reviving while purges run. Checked for races by the sanitizers.
TEST(ImmutableStringTest, ConcurrentCreateCopyDropPurge) {
  std::vector<std::string> texts;
  for (int i = 0; i < 8; ++i) texts.push_back(Unique("race"));
  std::atomic<int> mismatches{0};
  auto work = [&](int seed) {
    for (int round = 0; round < 20000; ++round) {
      const std::string& text = texts[(round * 7 + seed) % texts.size()];
      ImmutableString a = ImmutableString::CreateDynamic(text);
      ImmutableString b = a;
      if (b.Compare(text) != 0 || b.Length() != text.size()) mismatches.fetch_add(1);
      if (round % 64 == seed) ImmutableString::PurgeUnusedStrings();
    }
  };
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) threads.emplace_back(work, t);
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(mismatches.load(), 0);
  ImmutableString::PurgeUnusedStrings();
  EXPECT_FALSE(ImmutableString::PurgeUnusedStrings());
}

}  // namespace
