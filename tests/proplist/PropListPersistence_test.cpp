#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/proplist/PropListUtils.h>

#include <fstream>
#include <functional>
#include <iterator>

#include "PropListPersistenceSupport.h"
#include "PropListTestSupport.h"
#include "RandomPropList.h"

namespace kelcore::proplist::testing {
namespace {

using utils::LoadPropList;
using utils::ReadPropList;
using utils::SavePropList;
using utils::WritePropList;

constexpr const char* kHead = "<?xml version='1.0'?>\n<prop.map version='4'>\n";
constexpr const char* kVersionError =
    "$$$/kelcore/proplist/Error/PropListXMLHandler/VersionGreaterThan=Cannot read PropList data; "
    "version greater than expected.";
constexpr const char* kCorruptRename =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListCorruptRename=Error parsing "
    "properties list from file \"^1\". It has been renamed to \"^2\" for backup. Proceeding.";
constexpr const char* kLoadError =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListLoad=Error parsing properties "
    "list from file \"^1\".";
constexpr const char* kReadError =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListRead=Error parsing properties "
    "list from memory.";

std::string Written(const PropList& list) {
  UTF8String out = U8("stale");
  WritePropList(out, list);
  return std::string(out.begin(), out.end());
}

void WriteFile(const std::filesystem::path& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}

// The document format's edge cases, written byte for byte.
TEST_F(PersistenceTest, WritesTheExactDocument) {
  struct Case {
    const char* what;
    std::function<void(PropList&)> fill;
    std::string body;  // between the prop.map lines
  };
  const Case cases[] = {
      {"empty list", [](PropList&) {}, "<prop.list>\n</prop.list>\n"},
      {"keys in byte order, escaped",
       [](PropList& l) {
         l.SetValue(U8("b"), std::int32_t{1});
         l.SetValue(U8("a<&"), U16(u"x'\"y\u00e9"));
       },
       "<prop.list>\n<prop.pair>\n<key>a&lt;&amp;</key>\n<ustring>x&apos;&quot;y\xC3\xA9"
       "</ustring>\n</prop.pair>\n<prop.pair>\n<key>b</key>\n<int type='signed' size='32'>1"
       "</int>\n</prop.pair>\n</prop.list>\n"},
      {"empty int32 array", [](PropList& l) { l.SetValue(U8("e"), std::list<std::int32_t>()); },
       "<prop.list>\n<prop.pair>\n<key>e</key>\n<array>\n<array.type><int type='signed' "
       "size='32'/></array.type>\n</array>\n</prop.pair>\n</prop.list>\n"},
      {"bool array and numbers",
       [](PropList& l) {
         l.SetValue(U8("b"), std::list<bool>{true, false});
         l.SetValue(U8("d"), 1e20);
         l.SetValue(U8("f"), 0.1f);
         l.SetValue(U8("u"), std::uint64_t{18446744073709551615u});
       },
       "<prop.list>\n<prop.pair>\n<key>b</key>\n<array>\n<array.type><bool/></array.type>\n"
       "<true/>\n<false/>\n</array>\n</prop.pair>\n<prop.pair>\n<key>d</key>\n<double>1e+20"
       "</double>\n</prop.pair>\n<prop.pair>\n<key>f</key>\n<float>0.1</float>\n</prop.pair>\n"
       "<prop.pair>\n<key>u</key>\n<int type='unsigned' size='64'>18446744073709551615</int>\n"
       "</prop.pair>\n</prop.list>\n"},
      {"nested list carries no version",
       [](PropList& l) {
         l.NewSubList(U8("n"))->SetValue(U8("s"), U8("t"));
         l.GetSubList(U8("n"))->SetVersion(1);
       },
       "<prop.list>\n<prop.pair>\n<key>n</key>\n<prop.list>\n<prop.pair>\n<key>s</key>\n"
       "<string>t</string>\n</prop.pair>\n</prop.list>\n</prop.pair>\n</prop.list>\n"},
  };
  for (const Case& c : cases) {
    PropList list;
    c.fill(list);
    EXPECT_EQ(Written(list), kHead + c.body + "</prop.map>\n") << c.what;
  }
  PropList old;
  old.SetVersion(1);
  EXPECT_EQ(Written(old),
            "<?xml version='1.0'?>\n<prop.map version='1'>\n<prop.list>\n</prop.list>\n"
            "</prop.map>\n");
}

// Documents the writer never produces, read by the lenient rules.
TEST_F(PersistenceTest, ReadsLeniently) {
  struct Case {
    const char* what;
    std::string pairs;  // inside the top prop.list
    std::function<void(PropList&)> expected;
  };
  const Case cases[] = {
      {"value before any key", "<int type='signed' size='32'>7</int>",
       [](PropList& l) { l.SetValue(U8(""), std::int32_t{7}); }},
      {"int of another size keeps the previous kind",
       "<key>a</key><double>1.5</double><key>b</key><int type='signed' size='8'>3</int>",
       [](PropList& l) {
         l.SetValue(U8("a"), 1.5);
         l.SetValue(U8("b"), 3.0);
       }},
      {"int without type is no value; its key runs on",
       "<prop.pair><key>a</key><int size='32'>5</int></prop.pair>"
       "<prop.pair><key>b</key><true/></prop.pair>",
       [](PropList& l) { l.SetValue(U8("ab"), true); }},
      {"size 16 is unsigned whatever the type; unparsable and out of range",
       "<key>a</key><int type='signed' size='16'>70000</int><key>b</key>"
       "<int type='signed' size='64'>x1</int><key>c</key><int type='unsigned' size='32'>-1</int>"
       "<key>d</key><float> 2.5e1junk</float>",
       [](PropList& l) {
         l.SetValue(U8("a"), std::uint16_t{65535});
         l.SetValue(U8("b"), std::int64_t{0});
         l.SetValue(U8("c"), std::uint32_t{4294967295u});
         l.SetValue(U8("d"), 25.0f);
       }},
      {"unknown elements and stray text are dropped",
       "text<foo>bar</foo><key>k<b/>ey</key><string>v&amp;w</string><key>x</key><bool/>",
       [](PropList& l) {
         l.SetValue(U8("key"), U8("v&w"));
         l.SetValue(U8("x"), true);
       }},
      {"arrays: element kind from the last element, empty ones from array.type",
       "<key>b</key><array><array.type><bool/></array.type><true/><false/><true/></array>"
       "<key>m</key><array><int type='signed' size='32'>1</int><true/></array>"
       "<key>e</key><array><array.type><ustring/></array.type></array>"
       "<key>n</key><array><array.type><blob/></array.type></array>"
       "<key>i</key><array><int type='unsigned' size='16'>4</int>"
       "<int type='signed' size='64'>-5</int></array>",
       [](PropList& l) {
         l.SetValue(U8("b"), std::list<bool>{true, false, true});
         l.SetValue(U8("m"), std::list<bool>{false, true});
         l.SetValue(U8("e"), std::list<UTF16String>());
         l.SetValue(U8("i"), std::list<std::int64_t>{4, -5});
       }},
      {"nested lists; a second list of the same key adds to the first",
       "<key>n</key><prop.list><key>a</key><true/></prop.list>"
       "<key>n</key><prop.list><key>b</key><false/><key>c</key><prop.list/></prop.list>",
       [](PropList& l) {
         PropList* n = l.NewSubList(U8("n"));
         n->SetValue(U8("a"), true);
         n->SetValue(U8("b"), false);
         n->NewSubList(U8("c"));
       }},
  };
  for (const Case& c : cases) {
    const std::string document =
        "<prop.map version='4'><prop.list>" + c.pairs + "</prop.list></prop.map>";
    PropList read;
    ReadPropList(U8(document), read);
    PropList expected;
    c.expected(expected);
    EXPECT_EQ(read, expected) << c.what;
  }
}

TEST_F(PersistenceTest, VersionsUpToFourAreTakenAndAboveRefused) {
  PropList list;
  ReadPropList(U8("<prop.map version='1'><prop.list><key>n</key><ustring>2.5</ustring>"
                  "</prop.list></prop.map>"),
               list);
  EXPECT_EQ(list.GetVersion(), 1);
  double number = 0;
  EXPECT_TRUE(list.GetValue(U8("n"), number));
  EXPECT_EQ(number, 2.5);

  list.SetVersion(2);
  ReadPropList(U8("<prop.map><prop.list/></prop.map>"), list);
  EXPECT_EQ(list.GetVersion(), 2) << "no version attribute leaves the version alone";
  ReadPropList(U8("<prop.map version='x'><prop.list/></prop.map>"), list);
  EXPECT_EQ(list.GetVersion(), 0);

  for (const char* version : {"5", "70000"}) {
    const RaisedError error = ErrorOf([&] {
      ReadPropList(U8(std::string("<prop.map version='") + version +
                      "'><prop.list>"
                      "<key>a</key><true/></prop.list></prop.map>"),
                   list);
    });
    EXPECT_EQ(error.key, kVersionError);
    EXPECT_EQ(error.component, 104);
    EXPECT_EQ(list.GetPropertyType(U8("a")), kPropTypeNone);
  }

  // A version refused while the manager defers errors ends the load all the same.
  const std::filesystem::path file = Directory() / "v5.xml";
  WriteFile(file, "<prop.map version='5'><prop.list><key>a</key><true/></prop.list></prop.map>");
  manager_.defer = true;
  list.SetValue(U8("old"), true);
  LoadPropList(PathOf("v5.xml"), list, true);
  ASSERT_EQ(manager_.deferred.size(), 1u);
  EXPECT_EQ(manager_.deferred[0].key, kVersionError);
  EXPECT_TRUE(list.IsEmpty());
  EXPECT_TRUE(std::filesystem::exists(file)) << "a newer file is not corrupt";
}

TEST_F(PersistenceTest, RandomListsRoundTrip) {
  for (std::uint64_t seed = 1; seed <= 400; ++seed) {
    RandomPropListGenerator random(seed, {.xmlSafe = true});
    PropList list = random.Make();
    list.SetVersion(static_cast<std::uint16_t>(seed % 5));
    UTF8String document;
    WritePropList(document, list);
    PropList read;
    ReadPropList(document, read);
    ASSERT_EQ(read, list) << "seed " << seed;
    EXPECT_EQ(read.GetVersion(), list.GetVersion()) << "seed " << seed;
  }
}

TEST_F(PersistenceTest, SaveAndLoadThroughFiles) {
  RandomPropListGenerator random(77, {.xmlSafe = true});
  const PropList list = random.Make();
  const UTF16String path = PathOf("Settings.XML");
  SavePropList(path, list);
  SavePropList(filesupport::File(path), list);  // over the existing file
  EXPECT_EQ(FileContent(Directory() / "Settings.XML"), Written(list));
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(Directory()), {}), 1)
      << "no temporary file stays behind";
  PropList loaded;
  loaded.SetValue(U8("kept"), true);
  LoadPropList(path, loaded, true);
  PropList expected = list;
  expected.SetValue(U8("kept"), true);
  EXPECT_EQ(loaded, expected) << "loading adds to the list";

  EXPECT_THROW(SavePropList(PathOf("no/such/dir.xml"), list), filesupport::dir_not_found_exception);
}

TEST_F(PersistenceTest, CorruptFileIsRenamedOverAnOlderBackup) {
  const std::string corrupt = "<prop.map version='4'><prop.list><key>a</key>";
  WriteFile(Directory() / "prefs.xml", corrupt);
  WriteFile(Directory() / "prefs.xml.old", "older backup");
  PropList list;
  list.SetValue(U8("x"), true);
  const RaisedError error = ErrorOf([&] { LoadPropList(PathOf("prefs.xml"), list, true); });
  EXPECT_EQ(error.key, kCorruptRename);
  EXPECT_EQ(error.number, 3);
  EXPECT_EQ(error.value1, PathOf("prefs.xml"));
  EXPECT_EQ(error.value2, U16(u"prefs.xml.old"));
  EXPECT_TRUE(list.IsEmpty());
  EXPECT_FALSE(std::filesystem::exists(Directory() / "prefs.xml"));
  EXPECT_EQ(FileContent(Directory() / "prefs.xml.old"), corrupt);

  // Without renaming, and for a missing file, the plain load error names the path.
  WriteFile(Directory() / "bad.xml", "not xml");
  for (const char* name : {"bad.xml", "missing.xml"}) {
    const bool rename = name[0] == 'm';
    const RaisedError plain = ErrorOf([&] { LoadPropList(PathOf(name), list, rename); });
    EXPECT_EQ(plain.key, kLoadError) << name;
    EXPECT_EQ(plain.value1, PathOf(name));
  }
  EXPECT_EQ(FileContent(Directory() / "bad.xml"), "not xml");
  EXPECT_FALSE(std::filesystem::exists(Directory() / "missing.xml.old"));
}

TEST_F(PersistenceTest, FailedReadKeepsWhatWasReadAndMissingFactoryIsAnError) {
  PropList list;
  const RaisedError error = ErrorOf(
      [&] { ReadPropList(U8("<prop.map><prop.list><key>a</key><true/><key>b</key><oops"), list); });
  EXPECT_EQ(error.key, kReadError);
  EXPECT_EQ(error.number, 6);
  EXPECT_EQ(list.GetPropertyType(U8("a")), kPropTypeBool);

  xml::ResetParserFactory();
  EXPECT_EQ(ErrorOf([&] { ReadPropList(U8("<prop.map/>"), list); }).key,
            "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryRead=Missing XML "
            "Parser Factory in ReadPropList.");
  EXPECT_EQ(ErrorOf([&] { LoadPropList(PathOf("x.xml"), list, false); }).key,
            "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryLoad=Missing XML "
            "Parser Factory in LoadPropList.");
}

}  // namespace
}  // namespace kelcore::proplist::testing
