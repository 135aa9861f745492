#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/config/Localizer.h>

#include <filesystem>
#include <fstream>
#include <random>

#include "ConfigTestSupport.h"

namespace kelcore::config::testing {
namespace {

namespace fs = std::filesystem;

std::string ToUTF8(const fs::path& path) {
  const std::u8string text = path.u8string();
  return std::string(text.begin(), text.end());
}

// A fresh directory under the system's temporary folder, removed with the test.
class TemporaryDirectory {
 public:
  TemporaryDirectory() {
    std::random_device random;
    for (;;) {
      path_ = fs::temp_directory_path() / ("kelcore-localizer-" + std::to_string(random()));
      if (fs::create_directory(path_)) break;
    }
  }
  ~TemporaryDirectory() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
  }
  const fs::path& path() const { return path_; }
  UTF16String Folder() const { return U16(ToUTF8(path_).c_str()); }
  void Write(const char* name, const std::string& content) const {
    std::ofstream(path_ / name, std::ios::binary) << content;
  }

 private:
  fs::path path_;
};

using LocalizerTest = ConfigTest;

TEST_F(LocalizerTest, SlotInstallsAndUninstalls) {
  RecordingLocalizer localizer;
  EXPECT_FALSE(Localizer::Initialized());
  Localizer::Set(&localizer);
  EXPECT_TRUE(Localizer::Initialized());
  EXPECT_EQ(Localizer::Get(), &localizer);
  Localizer::Set(nullptr);
  EXPECT_FALSE(Localizer::Initialized());
  EXPECT_THROW(Localizer::Get(), std::logic_error);
}

TEST_F(LocalizerTest, LibraryDictionariesLoadOnceALanguageIsSet) {
  RecordingLocalizer localizer;
  Localizer::Set(&localizer);
  EXPECT_TRUE(localizer.loadedFolders.empty()) << "no language yet";

  utility::Locale::SetApplicationLangauge(U16("fr_FR"));
  Localizer::LoadKELDictionaries();
  Localizer::Set(&localizer);
  ASSERT_EQ(localizer.loadedFolders.size(), 2u);
  EXPECT_EQ(localizer.loadedFolders[0], localizer.loadedFolders[1]);

  // <folder of the kelcore library>/kel_fr_FR/dict
  const fs::path folder(
      std::u8string(reinterpret_cast<const char8_t*>(U8(localizer.loadedFolders[0]).c_str())));
  EXPECT_EQ(folder.filename(), "dict");
  EXPECT_EQ(folder.parent_path().filename(), "kel_fr_FR");
  bool libraryFound = false;
  for (const auto& entry : fs::directory_iterator(folder.parent_path().parent_path())) {
    const std::string name = ToUTF8(entry.path().filename());
    libraryFound |= name.rfind("libkelcore", 0) == 0 || name.rfind("kelcore.dll", 0) == 0;
  }
  EXPECT_TRUE(libraryFound) << ToUTF8(folder);
}

TEST_F(LocalizerTest, DefaultLocalizerAnswersWithTheDefaultText) {
  DefaultLocalizer localizer;
  EXPECT_EQ(localizer.LocalizeString("$$$/a/b=Text = with equals"), U16("Text = with equals"));
  EXPECT_EQ(localizer.LocalizeString("$$$/a/b="), UTF16String());
  EXPECT_EQ(localizer.LocalizeString("plain text"), U16("plain text"));
  EXPECT_EQ(localizer.LocalizeString(nullptr), UTF16String());
}

TEST_F(LocalizerTest, DefaultLocalizerTranslatesFromADictionaryFolder) {
  TemporaryDirectory directory;
  directory.Write("a.txt",
                  "\xEF\xBB\xBF# comment\r\n"
                  "$$$/t/one=Un\r\n"
                  "$$$/t/two= Deux \\n\\t\\\\ \\x \n"
                  "\n"
                  "not a key=ignored\n"
                  "$$$/t/noequals\n"
                  "$$$/t/bad=\xFF\xFE\n"
                  "$$$/t/three=Trois (a)");
  directory.Write("b.txt", "$$$/t/three=Trois (b)\n$$$/t/\xC3\xA9=\xC3\xA9t\xC3\xA9\n");
  directory.Write("c.dat", "$$$/t/one=ignored\n");
  fs::create_directory(directory.path() / "sub.txt");

  DefaultLocalizer localizer;
  localizer.LoadDictionary(directory.Folder());
  EXPECT_EQ(localizer.GetEntryCount(), 4u);
  EXPECT_EQ(localizer.LocalizeString("$$$/t/one=One"), U16("Un"));
  EXPECT_EQ(localizer.LocalizeString("$$$/t/two=Two"), U16(" Deux \n\t\\ \\x "));
  EXPECT_EQ(localizer.LocalizeString("$$$/t/three=Three"), U16("Trois (b)"));
  EXPECT_EQ(localizer.LocalizeString("$$$/t/\xC3\xA9=E"), U16("\xC3\xA9t\xC3\xA9"));
  EXPECT_EQ(localizer.LocalizeString("$$$/t/bad=Bad"), U16("Bad"));
  EXPECT_EQ(localizer.LocalizeString("$$$/t/four=Four"), U16("Four"));

  directory.Write("b.txt", "$$$/t/one=Eins\n");
  localizer.LoadDictionary(directory.Folder());
  EXPECT_EQ(localizer.LocalizeString("$$$/t/one=One"), U16("Eins")) << "later loads replace";
  EXPECT_EQ(localizer.LocalizeString("$$$/t/two=Two"), U16(" Deux \n\t\\ \\x "));

  localizer.LoadDictionary(directory.Folder() + U16("/missing"));
  EXPECT_EQ(localizer.GetEntryCount(), 4u);
}

}  // namespace
}  // namespace kelcore::config::testing
