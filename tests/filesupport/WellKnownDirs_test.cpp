#include <gtest/gtest.h>
#include <pwd.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <map>
#include <optional>
#include <string>

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/filesupport/CommonDirs.h>
#include <kelcore/filesupport/FileExceptions.h>

#include "TempDirFixture.h"
#include "filesupport/WellKnownDirsState.h"
#include "filesupport/XdgDirs.h"

namespace {

using kelcore::UTF16String;
using namespace kelcore::filesupport;
namespace cd = kelcore::filesupport::commondirs;
namespace config = kelcore::config;
using detail::XdgEnvironment;

// --- The XDG rules, on environments and files handed in. -------------------------------

struct UserDirCase {
  const char* text;
  std::optional<std::string> documents;  // for home "/h"
};

// Forms found in user-dirs.dirs as xdg-user-dirs-update writes it, and shell forms a
// user may write by hand.
const UserDirCase kUserDirCases[] = {
    {"XDG_DOCUMENTS_DIR=\"$HOME/Docs\"\n", "/h/Docs"},
    {"# XDG_DOCUMENTS_DIR=\"$HOME/No\"\nXDG_DESKTOP_DIR=\"$HOME/D\"\n", std::nullopt},
    {"  \tXDG_DOCUMENTS_DIR = \"/srv/docs\"  # shared\r\n", "/srv/docs"},
    {"XDG_DOCUMENTS_DIR=\"${HOME}/My \\\"Docs\\\"\"", "/h/My \"Docs\""},
    {"XDG_DOCUMENTS_DIR=\"$HOME\"", "/h"},
    {"XDG_DOCUMENTS_DIR=$HOME/Plain#comment\r\n", "/h/Plain"},
    {"XDG_DOCUMENTS_DIR=\"/a\"\nXDG_DOCUMENTS_DIR=\"$HOME/b\"\n", "/h/b"},  // last wins
    {"XDG_DOCUMENTS_DIR=\"/a\"\nXDG_DOCUMENTS_DIR=\"relative\"\n", "/a"},   // bad ones don't
    {"XDG_DOCUMENTS_DIR=\"/a\"\nXDG_DOCUMENTS_DIR=\"$HOME/open\n", "/a"},   // unclosed
    {"XDG_DOCUMENTS_DIR=\"$HOMEWORK/x\"", std::nullopt},
    {"XDG_DOCUMENTS_DIRS=\"/x\"\nMY_XDG_DOCUMENTS_DIR=\"/y\"", std::nullopt},
    {"XDG_DOCUMENTS_DIR=", std::nullopt},
    {"XDG_DOCUMENTS_DIR=\"/caf\xC3\xA9/\xFF\"", "/caf\xC3\xA9/\xFF"},  // bytes kept as they are
    {"", std::nullopt},
};

TEST(XdgDirs, UserDirsFileIsReadAsTheShellWould) {
  for (const UserDirCase& c : kUserDirCases) {
    EXPECT_EQ(detail::FindXdgUserDir(c.text, "DOCUMENTS", "/h"), c.documents) << c.text;
  }
  // Without a home, only absolute values count.
  EXPECT_EQ(detail::FindXdgUserDir("XDG_DESKTOP_DIR=\"$HOME/D\"", "DESKTOP", ""), std::nullopt);
  EXPECT_EQ(detail::FindXdgUserDir("XDG_DESKTOP_DIR=\"/d\"", "DESKTOP", ""), "/d");
}

TEST(XdgDirs, SystemFoldersFromTheEnvironment) {
  const XdgEnvironment bare{"/h", "", "", ""};
  const XdgEnvironment set{"/h", "/cfg", "/data", "/scratch/"};
  const XdgEnvironment relative{"/h", "cfg", "data", ""};
  const XdgEnvironment homeless{"", "", "", ""};
  const char* userDirs = "XDG_DOCUMENTS_DIR=\"$HOME/Dokumente\"\n";
  struct Case {
    SystemFolder id;
    const XdgEnvironment* env;
    std::string expected;
  };
  const Case cases[] = {
      {SystemFolder::kAppData, &bare, "/h/.config"},
      {SystemFolder::kAppData, &set, "/cfg"},
      {SystemFolder::kAppData, &relative, "/h/.config"},  // XDG ignores relative paths
      {SystemFolder::kAppData, &homeless, ""},
      {SystemFolder::kDocuments, &bare, "/h/Dokumente"},
      {SystemFolder::kDocuments, &homeless, ""},
      {SystemFolder::kDesktop, &bare, "/h/Desktop"},
      {SystemFolder::kCommonDocuments, &bare, "/h/.local/share/Varden/Shared"},
      {SystemFolder::kCommonDocuments, &set, "/data/Varden/Shared"},
      {SystemFolder::kCommonDocuments, &relative, "/h/.local/share/Varden/Shared"},
      {SystemFolder::kCommonDocuments, &homeless, ""},
      {SystemFolder::kTemp, &bare, "/tmp"},
      {SystemFolder::kTemp, &set, "/scratch/"},
      {SystemFolder::kTemp, &homeless, "/tmp"},
      {SystemFolder::kProgramFiles, &homeless, "/opt"},
      {SystemFolder::kProgramFilesCommon, &homeless, "/opt/common"},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(detail::XdgSystemFolder(c.id, *c.env, userDirs), c.expected)
        << static_cast<int>(c.id) << " home " << c.env->home;
  }
}

// --- The real functions, with the environment pointed into a temporary directory. ------

class WellKnownDirsTest : public TempDirTest {
 protected:
  static constexpr const char* kVariables[] = {"HOME", "XDG_CONFIG_HOME", "XDG_DATA_HOME",
                                               "TMPDIR"};

  void SetUp() override {
    TempDirTest::SetUp();
    for (const char* name : kVariables) {
      const char* value = std::getenv(name);
      if (value != nullptr) saved_[name] = value;
    }
    ::unsetenv("XDG_CONFIG_HOME");
    ::unsetenv("XDG_DATA_HOME");
    ::setenv("HOME", (RootBytes() + "/home").c_str(), 1);
    ::setenv("TMPDIR", (RootBytes() + "/tmp/").c_str(), 1);
    MakeDir("home");
    MakeDir("tmp");
    detail::ResetWellKnownDirs();
    config::ResetClientIdentity();
    config::SetCompanyName(u"Acme");
    config::SetClientName(u"Mixer");
    config::SetClientInternalVersion(u"7.1");
  }

  void TearDown() override {
    for (const char* name : kVariables) {
      const auto found = saved_.find(name);
      if (found == saved_.end()) {
        ::unsetenv(name);
      } else {
        ::setenv(name, found->second.c_str(), 1);
      }
    }
    detail::ResetWellKnownDirs();
    config::ResetClientIdentity();
    TempDirTest::TearDown();
  }

  Dir Under(const std::string& relative) const { return Dir(RootBytes() + "/" + relative); }

  static Dir ExecutableFolder() {
    return Dir(std::filesystem::read_symlink("/proc/self/exe").parent_path().string());
  }

 private:
  std::map<std::string, std::string> saved_;
};

TEST_F(WellKnownDirsTest, PrefDirSetByTheHostIsReturnedUnchanged) {
  config::SetClientPrefsDir(Under("prefs/deep/").FullPath() + u"/");
  EXPECT_EQ(Dir::PrefDir(), Under("prefs/deep"));
  EXPECT_FALSE(OnDisk("prefs"));
  EXPECT_FALSE(OnDisk("home/.config"));
}

TEST_F(WellKnownDirsTest, PrefDirDescendsThroughCompanyClientAndVersion) {
  EXPECT_EQ(Dir::PrefDir(), Under("home/.config/Acme/Mixer/7.1"));
  EXPECT_TRUE(OnDisk("home/.config/Acme/Mixer/7.1"));
  EXPECT_EQ(Dir::PrefDir(), Under("home/.config/Acme/Mixer/7.1"));  // existing: no error

  ::setenv("XDG_CONFIG_HOME", (RootBytes() + "/cfg").c_str(), 1);
  MakeDir("cfg");
  WriteFile("cfg/Acme");  // a file where the company level belongs
  try {
    Dir::PrefDir();
    FAIL() << "a file in the way";
  } catch (const dir_create_exception& e) {
    EXPECT_EQ(e.GetDir(), Under("cfg/Acme"));
  }
}

TEST_F(WellKnownDirsTest, SystemFoldersFollowTheEnvironment) {
  EXPECT_EQ(Dir::TempDir(), Under("tmp"));  // the trailing separator of $TMPDIR goes
  EXPECT_EQ(cd::UserCacheDir(), Under("tmp"));
  EXPECT_EQ(Dir::GlobalPrefDir(), Under("home/.config"));
  EXPECT_TRUE(OnDisk("home/.config"));
  EXPECT_EQ(Dir::CommonFilesDir().FullPath(), u"/opt/common");
  EXPECT_EQ(Dir::GlobalCommonFilesDir().FullPath(), u"/opt/Varden/Common");
  EXPECT_EQ(cd::AllUserPluginsDir().FullPath(), u"/opt/Varden/Common/Plug-ins");
  EXPECT_EQ(cd::UserPluginsDir(), cd::AllUserPluginsDir());

  ::setenv("XDG_DATA_HOME", (RootBytes() + "/data").c_str(), 1);
  EXPECT_EQ(cd::AllUsersDocumentsDir(), Under("data/Varden/Shared"));
  EXPECT_EQ(Dir::SharedDocsDir(), Under("data/Varden/Shared"));
  EXPECT_FALSE(OnDisk("data"));  // never created
  ::unsetenv("XDG_DATA_HOME");
  EXPECT_EQ(cd::AllUsersDocumentsDir(), Under("data/Varden/Shared"));  // cached

  // Without $HOME, the home directory of the user database.
  ::unsetenv("HOME");
  const passwd* user = ::getpwuid(::getuid());
  ASSERT_NE(user, nullptr);
  EXPECT_EQ(DirHelper::SystemDir(SystemFolder::kDesktop),
            Dir(std::string(user->pw_dir) + "/Desktop"));

  // The application-data folder cannot be created: the application directory stands in.
  WriteFile("blocker");
  ::setenv("XDG_CONFIG_HOME", (RootBytes() + "/blocker/cfg").c_str(), 1);
  EXPECT_EQ(DirHelper::SystemDir(SystemFolder::kAppData, true), Dir());
  EXPECT_EQ(Dir::GlobalPrefDir(), Dir::AppDir());
}

TEST_F(WellKnownDirsTest, UserDocumentsAndDesktopAreCreated) {
  MakeDir("home/.config");
  WriteFile("home/.config/user-dirs.dirs", "XDG_DOCUMENTS_DIR=\"$HOME/Papers\"\n");
  EXPECT_EQ(cd::UserDocumentsDir(), Under("home/Papers"));
  EXPECT_EQ(Dir::UserDocsDir(), Under("home/Papers"));
  EXPECT_EQ(cd::UserDesktopDir(), Under("home/Desktop"));
  EXPECT_TRUE(OnDisk("home/Papers"));
  EXPECT_TRUE(OnDisk("home/Desktop"));
  EXPECT_EQ(cd::CurrentUserDir(), Under("home"));

  // A home that is a file: neither folder can be had.
  WriteFile("plain");
  ::setenv("HOME", (RootBytes() + "/plain").c_str(), 1);
  struct Case {
    Dir (*function)();
    const char* key;
  };
  for (const Case& c : {Case{cd::UserDocumentsDir, "$$$/kelcore/filesupport/DirUserDocs="},
                        Case{cd::UserDesktopDir, "$$$/kelcore/filesupport/DirDesktopDocs="}}) {
    try {
      c.function();
      ADD_FAILURE() << c.key;
    } catch (const dir_exception& e) {
      EXPECT_EQ(std::strncmp(e.what(), c.key, std::strlen(c.key)), 0) << e.what();
      EXPECT_EQ(e.GetDir(), Dir());
    }
  }
}

TEST_F(WellKnownDirsTest, AppAndPackageDirAreOnePath) {
  const Dir executable = ExecutableFolder();
  EXPECT_EQ(Dir::AppDir(), executable);
  EXPECT_EQ(cd::MainExecutableFile(),
            File(std::filesystem::read_symlink("/proc/self/exe").string()));

  cd::SetPackageDirOverride(Under("pkg/"));
  EXPECT_EQ(Dir::AppDir(), Under("pkg"));
  cd::SetAppDirOverride(Under("app"));
  EXPECT_EQ(Dir::PackageDir(), Under("app"));
  cd::SetAppDirOverride(Dir());
  EXPECT_EQ(Dir::PackageDir(), executable);

  cd::SetMainExecutableOverride(File(RootBytes() + "/tool"));
  EXPECT_EQ(cd::MainExecutableFile(), File(RootBytes() + "/tool"));
}

TEST_F(WellKnownDirsTest, CachedDirectoriesAndTheirOverrides) {
  struct Case {
    Dir (*get)();
    void (*set)(const Dir&);
    std::string defaultName;  // inside the application directory
  };
  const Case cases[] = {
      {cd::ExecutableDir, cd::SetExecutableDirOverride, ""},
      {cd::ResourcesDir, cd::SetResourcesDirOverride, ""},
      {cd::PluginsDir, cd::SetPluginsDirOverride, "Plug-ins"},
      {cd::RequiredPluginsDir, cd::SetRequiredPluginsDirOverride, "Required"},
  };
  cd::SetAppDirOverride(Under("app"));
  for (const Case& c : cases) {
    const Dir byDefault = Under("app/" + c.defaultName);
    EXPECT_EQ(c.get(), byDefault) << c.defaultName;
    c.set(Under("elsewhere"));
    EXPECT_EQ(c.get(), Under("elsewhere")) << c.defaultName;
    c.set(Dir());
    EXPECT_EQ(c.get(), byDefault) << c.defaultName;
  }
  // A cache keeps what it computed when the application directory changes later.
  cd::SetAppDirOverride(Under("moved"));
  EXPECT_EQ(cd::PluginsDir(), Under("app/Plug-ins"));
}

TEST_F(WellKnownDirsTest, FontCacheIsMadeUnderTheCacheDirectory) {
  config::SetApplicationName(u"Mixer Pro");
  WriteFile("tmp/Acme");  // in the way
  try {
    cd::AppFontCacheDir();
    FAIL() << "a file in the way";
  } catch (const dir_exception& e) {
    EXPECT_STREQ(e.what(),
                 "$$$/kelcore/filesupport/DirAppFontCache=Can't write to font cache directory.");
    EXPECT_EQ(e.GetDir(), Dir());
  }
  std::filesystem::remove(RootBytes() + "/tmp/Acme");
  EXPECT_EQ(cd::AppFontCacheDir(), Under("tmp/Acme/Mixer Pro/7.1/Typesupport"));
  EXPECT_TRUE(OnDisk("tmp/Acme/Mixer Pro/7.1/Typesupport"));

  cd::SetAppFontCacheDirOverride(Under("fonts"));
  EXPECT_EQ(cd::AppFontCacheDir(), Under("fonts"));
}

}  // namespace
