#include <kelcore/utility/ReplaceInString.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

namespace kelcore::utility {
namespace {

UTF16String U16(const char* ascii) {
  return AsciiToUTF16(ascii, std::char_traits<char>::length(ascii));
}

// Vectors: the first is the error model's own example; the rest cover each rule.
TEST(ReplaceInStringTest, AtSubstitution) {
  const struct {
    const char* text;
    const char* expected;
  } cases[] = {
      {"a@0b@@c@xd@", "aZb@c@xd@"},
      {"@0@0", "ZZ"},
      {"@1@2@9", "one"},
      {"@", "@"},
      {"@@0", "@0"},
      {"", ""},
      {"no placeholders", "no placeholders"},
  };
  const UTF16String one = U16("one");
  for (const auto& c : cases) {
    EXPECT_EQ(ReplaceInString(U16(c.text), U16("Z"), one), U16(c.expected)) << c.text;
    EXPECT_EQ(ReplaceInString(U16(c.text), std::vector<UTF16String>{U16("Z"), one}),
              U16(c.expected))
        << c.text;
  }
}

TEST(ReplaceInStringTest, ArgumentsAreNotScannedAgain) {
  EXPECT_EQ(ReplaceInString(U16("@0-@1"), U16("@1"), U16("x")), U16("@1-x"));
  std::vector<UTF16String> eleven(11, U16("v"));
  eleven[9] = U16("nine");
  EXPECT_EQ(ReplaceInString(U16("@9"), eleven), U16("nine"));
}

}  // namespace
}  // namespace kelcore::utility
