// Reading documents from files, and what a parser must refuse to read or expand.
#include <kelcore/xml/ExpatParserFactory.h>

#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "RecordingHandler.h"
#include "TemporaryDirectory.h"

namespace kelcore::xml {
namespace {

using test_support::Bytes;
using test_support::RecordingHandler;
using test_support::TemporaryDirectory;
using test_support::Wide;
using Events = std::vector<std::string>;

std::unique_ptr<AbstractDocParser> MakeParser(Events* events) {
  return ExpatParserFactory().GetParser(std::make_unique<RecordingHandler>(events));
}

bool Mentions(const Events& events, const std::string& text) {
  for (const std::string& event : events) {
    if (event.find(text) != std::string::npos) return true;
  }
  return false;
}

TEST(ExpatDocumentsTest, FileGivesTheSameEventsAsMemory) {
  TemporaryDirectory dir;
  const std::string document =
      "<?xml version='1.0'?>\n<r xmlns:p='urn:p'><!--c--><p:a k='v'>t&amp;<![CDATA[x]]></p:a></r>";
  const std::string path = dir.Write("doc \xC3\xA9.xml", document);
  Events fromFile, fromMemory;
  EXPECT_EQ(MakeParser(&fromFile)->ParseDocument(Wide(path)), kXMLParseSuccess);
  EXPECT_EQ(MakeParser(&fromMemory)->ParseBuffer(Bytes(document)), kXMLParseSuccess);
  EXPECT_EQ(fromFile, fromMemory);
  EXPECT_EQ(fromFile.back(), "enddoc");
}

TEST(ExpatDocumentsTest, UnreadablePathsFailWithoutEvents) {
  TemporaryDirectory dir;
  for (const std::string& path : {(dir.Path() / "missing.xml").string(), dir.Path().string(),
                                  std::string(), std::string("a\0b", 3)}) {
    Events events;
    EXPECT_EQ(MakeParser(&events)->ParseDocument(Wide(path)), kXMLParseFailure) << path;
    EXPECT_TRUE(events.empty()) << path;
  }
}

// Many read steps, with multi-byte characters across step boundaries; the parser counts
// elements and text rather than recording them.
class CountingHandler : public AbstractParseHandler {
 public:
  void StartElementWithNamespace(const UTF16String&, const UTF16String&, const UTF16String&,
                                 const AttributeVector& attributes) override {
    ++elements;
    attributeUnits += attributes.empty() ? 0 : attributes[0].value.size();
  }
  void Characters(const UTF16String& text) override { textUnits += text.size(); }
  void EndDocument() override { ended = true; }
  std::size_t elements = 0, attributeUnits = 0, textUnits = 0;
  bool ended = false;
};

TEST(ExpatDocumentsTest, LargeFileStreams) {
  TemporaryDirectory dir;
  const std::string item = "<item v='\xE2\x82\xAC\xE2\x82\xAC'>\xF0\x9F\x98\x80 x</item>\n";
  const std::size_t count = 60000;  // about 2.5 MB
  std::string document = "<list>\n";
  for (std::size_t i = 0; i < count; ++i) document += item;
  document += "</list>\n";
  const std::string path = dir.Write("big.xml", document);

  auto owned = std::make_unique<CountingHandler>();
  CountingHandler* handler = owned.get();
  auto parser = ExpatParserFactory().GetParser(std::move(owned));
  ASSERT_EQ(parser->ParseDocument(Wide(path)), kXMLParseSuccess);
  EXPECT_EQ(handler->elements, count + 1);
  EXPECT_EQ(handler->attributeUnits, 2 * count);
  EXPECT_EQ(handler->textUnits, 1 + count * (4 + 1));  // surrogate pair, " x", line feed
  EXPECT_TRUE(handler->ended);

  // Cut short inside an element: the file ends before the document does.
  const std::string cut = dir.Write("cut.xml", document.substr(0, document.size() / 2));
  EXPECT_EQ(parser->ParseDocument(Wide(cut)), kXMLParseFailure);
}

// The classic exponential expansion (about 3 GB), and one large entity referenced many
// times (about 400 MB).
TEST(ExpatDocumentsTest, EntityAmplificationIsRefused) {
  std::string laughs = "<!DOCTYPE lolz [<!ENTITY lol0 'lol'>";
  for (int i = 1; i <= 10; ++i) {
    laughs += "<!ENTITY lol" + std::to_string(i) + " '";
    for (int j = 0; j < 10; ++j) laughs += "&lol" + std::to_string(i - 1) + ";";
    laughs += "'>";
  }
  laughs += "]><lolz>&lol10;</lolz>";
  std::string quadratic = "<!DOCTYPE a [<!ENTITY big '" + std::string(20000, 'x') + "'>]><a>";
  for (int i = 0; i < 20000; ++i) quadratic += "&big;";
  quadratic += "</a>";
  auto parser = ExpatParserFactory().GetParser(nullptr);
  EXPECT_EQ(parser->ParseBuffer(Bytes(laughs)), kXMLParseFailure);
  EXPECT_EQ(parser->ParseBuffer(Bytes(quadratic)), kXMLParseFailure);
}

// External entities, DTD subsets and parameter entities pointing at a file with a marker:
// the marker must never reach the handler, whatever form the reference takes.
TEST(ExpatDocumentsTest, NothingOutsideTheDocumentIsRead) {
  TemporaryDirectory dir;
  const std::string secret = dir.Write("secret.txt", "SECRET-MARKER");
  const std::string dtd =
      dir.Write("ext.dtd", "<!ENTITY e 'SECRET-MARKER'><!ATTLIST a d CDATA 'SECRET-MARKER'>");
  const std::string secretURL = "file://" + secret;
  const std::string dtdURL = "file://" + dtd;
  const struct {
    const char* what;
    std::string document;
    XMLParseStatus status;
  } cases[] = {
      {"external entity by URL", "<!DOCTYPE a [<!ENTITY x SYSTEM '" + secretURL + "'>]><a>&x;</a>",
       kXMLParseSuccess},
      {"external entity by path", "<!DOCTYPE a [<!ENTITY x SYSTEM '" + secret + "'>]><a>&x;</a>",
       kXMLParseSuccess},
      {"system passwd file", "<!DOCTYPE a [<!ENTITY x SYSTEM 'file:///etc/passwd'>]><a>&x;</a>",
       kXMLParseSuccess},
      {"external DTD subset", "<!DOCTYPE a SYSTEM '" + dtdURL + "'><a>&e;</a>", kXMLParseSuccess},
      {"public external DTD", "<!DOCTYPE a PUBLIC '-//x//y' '" + dtd + "'><a/>", kXMLParseSuccess},
      {"external parameter entity",
       "<!DOCTYPE a [<!ENTITY % p SYSTEM '" + dtdURL + "'>%p;]><a>&e;</a>", kXMLParseSuccess},
      {"external entity in an attribute",
       "<!DOCTYPE a [<!ENTITY x SYSTEM '" + secretURL + "'>]><a v='&x;'/>", kXMLParseFailure},
  };
  for (const auto& c : cases) {
    Events events;
    EXPECT_EQ(MakeParser(&events)->ParseBuffer(Bytes(c.document)), c.status) << c.what;
    EXPECT_FALSE(Mentions(events, "SECRET-MARKER")) << c.what;
    EXPECT_FALSE(Mentions(events, "root:")) << c.what;
  }
}

}  // namespace
}  // namespace kelcore::xml
