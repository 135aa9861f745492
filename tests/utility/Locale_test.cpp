#include <kelcore/utility/Locale.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

#include <stdexcept>

namespace kelcore::utility {
namespace {

UTF16String U16(const char* ascii) {
  return AsciiToUTF16(ascii, std::char_traits<char>::length(ascii));
}

TEST(LocaleTest, LanguageSetClearedAndChecked) {
  EXPECT_FALSE(Locale::IsInitialized());
  Locale::SetApplicationLangauge(U16("pt-BR_x1"));
  EXPECT_TRUE(Locale::IsInitialized());
  EXPECT_EQ(Locale::ApplicationLangauge(), U16("pt-BR_x1"));
  for (const char* bad : {"../fr", "fr FR", "fr/FR", "fr.FR"}) {
    EXPECT_THROW(Locale::SetApplicationLangauge(U16(bad)), std::invalid_argument) << bad;
  }
  EXPECT_THROW(Locale::SetApplicationLangauge(UTF16String(65, 'a')), std::invalid_argument);
  EXPECT_EQ(Locale::ApplicationLangauge(), U16("pt-BR_x1"));
  Locale::SetApplicationLangauge(UTF16String());
  EXPECT_FALSE(Locale::IsInitialized());
}

}  // namespace
}  // namespace kelcore::utility
