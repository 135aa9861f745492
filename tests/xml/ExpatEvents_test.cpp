#include <kelcore/xml/ExpatParserFactory.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "RecordingHandler.h"

namespace kelcore::xml {
namespace {

using test_support::Bytes;
using test_support::RecordingHandler;
using Events = std::vector<std::string>;

struct ParseResult {
  XMLParseStatus status;
  Events events;
};

ParseResult ParseBytes(const std::string& document) {
  Events events;
  auto parser = ExpatParserFactory().GetParser(std::make_unique<RecordingHandler>(&events));
  const XMLParseStatus status = parser->ParseBuffer(Bytes(document));
  return {status, events};
}

// Well-formed documents and the exact events they give. Vectors written for this
// parser; the namespace and text rules follow the XML 1.0 and Namespaces 1.0
// recommendations.
TEST(ExpatEventsTest, WellFormedDocuments) {
  const struct {
    const char* what;
    std::string document;
    Events events;
  } cases[] = {
      {"plain element with text",
       "<a x='1' y=\"2\">hi</a>",
       {"startdoc", "<a||a x||x=1 y||y=2", "t:hi", "</a||a", "enddoc"}},
      {"attributes in document order",
       "<a z='1' b='2' m='3'/>",
       {"startdoc", "<a||a z||z=1 b||b=2 m||m=3", "</a||a", "enddoc"}},
      {"default and prefixed namespaces",
       "<r xmlns='urn:d' xmlns:p='urn:p'><p:c p:at='v' at='w'/><c/></r>",
       {"startdoc", "+=urn:d", "+p=urn:p", "<r|urn:d|r", "<p:c|urn:p|c p:at|urn:p|at=v at||at=w",
        "</p:c|urn:p|c", "<c|urn:d|c", "</c|urn:d|c", "</r|urn:d|r", "-p", "-", "enddoc"}},
      {"default namespace undeclared",
       "<a xmlns='urn:x'><b xmlns=''/></a>",
       {"startdoc", "+=urn:x", "<a|urn:x|a", "+=", "<b||b", "</b||b", "-", "</a|urn:x|a", "-",
        "enddoc"}},
      {"prefix redeclared on a child",
       "<p:a xmlns:p='urn:1'><p:b xmlns:p='urn:2'/></p:a>",
       {"startdoc", "+p=urn:1", "<p:a|urn:1|a", "+p=urn:2", "<p:b|urn:2|b", "</p:b|urn:2|b", "-p",
        "</p:a|urn:1|a", "-p", "enddoc"}},
      {"cdata section keeps markup characters",
       "<a>x<![CDATA[<y>&amp;]]>z</a>",
       {"startdoc", "<a||a", "t:x", "[cdata", "t:<y>&amp;", "]cdata", "t:z", "</a||a", "enddoc"}},
      {"empty cdata section",
       "<a><![CDATA[]]></a>",
       {"startdoc", "<a||a", "[cdata", "]cdata", "</a||a", "enddoc"}},
      {"comments before and inside the root",
       "<!--c1--><a><!-- c2 --></a><!--c3-->",
       {"startdoc", "!c1", "<a||a", "! c2 ", "</a||a", "!c3", "enddoc"}},
      {"references merge into one text",
       "<a>1 &lt; 2 &amp; 3&#x41;&#66;&gt;</a>",
       {"startdoc", "<a||a", "t:1 < 2 & 3AB>", "</a||a", "enddoc"}},
      {"internal entity expands in text and attributes",
       "<!DOCTYPE a [<!ENTITY e 'ent'><!-- dtd -->]><a v='[&e;]'>x&e;y</a>",
       {"startdoc", "! dtd ", "<a||a v||v=[ent]", "t:xenty", "</a||a", "enddoc"}},
      {"attribute defaulted by the DTD comes last",
       "<!DOCTYPE a [<!ATTLIST a d CDATA 'def'>]><a x='1'/>",
       {"startdoc", "<a||a x||x=1 d||d=def", "</a||a", "enddoc"}},
      {"line ends normalised",
       "<a>1\r\n2\r3\n</a>",
       {"startdoc", "<a||a", "t:1\n2\n3\n", "</a||a", "enddoc"}},
      {"attribute value normalised",
       "<a v='x\ty\nz&#9;&quot;'/>",
       {"startdoc", "<a||a v||v=x y z\t\"", "</a||a", "enddoc"}},
      {"processing instruction separates text",
       "<?xml version='1.0'?><a>x<?pi d?>y</a>",
       {"startdoc", "<a||a", "t:x", "t:y", "</a||a", "enddoc"}},
      {"whitespace between elements is text",
       "<a>\n <b/>\n</a>\n",
       {"startdoc", "<a||a", "t:\n ", "<b||b", "</b||b", "t:\n", "</a||a", "enddoc"}},
      {"non-ASCII text and names",
       "<\xC3\xA9 a='\xF0\x9F\x98\x80'>\xE2\x82\xAC</\xC3\xA9>",
       {"startdoc", "<\xC3\xA9||\xC3\xA9 a||a=\xF0\x9F\x98\x80", "t:\xE2\x82\xAC",
        "</\xC3\xA9||\xC3\xA9", "enddoc"}},
      {"ISO-8859-1 declared",
       "<?xml version='1.0' encoding='ISO-8859-1'?><a>\xE9</a>",
       {"startdoc", "<a||a", "t:\xC3\xA9", "</a||a", "enddoc"}},
      {"UTF-16LE with byte-order mark",
       std::string("\xFF\xFE<\0a\0>\0\xAC\x20<\0/\0a\0>\0", 18),
       {"startdoc", "<a||a", "t:\xE2\x82\xAC", "</a||a", "enddoc"}},
  };
  for (const auto& c : cases) {
    const ParseResult run = ParseBytes(c.document);
    EXPECT_EQ(run.status, kXMLParseSuccess) << c.what;
    EXPECT_EQ(run.events, c.events) << c.what;
  }
}

// Documents that are not well formed (or not namespace well formed) fail with 10.
TEST(ExpatEventsTest, MalformedDocumentsFail) {
  const struct {
    const char* what;
    std::string document;
  } cases[] = {
      {"empty input", ""},
      {"only a declaration", "<?xml version='1.0'?>"},
      {"unclosed root", "<a>"},
      {"mismatched end tag", "<a></b>"},
      {"two roots", "<a/><b/>"},
      {"text before the root", "x<a/>"},
      {"duplicate attribute", "<a x='1' x='2'/>"},
      {"same expanded attribute name", "<a xmlns:p='u' xmlns:q='u' p:x='1' q:x='2'/>"},
      {"undeclared prefix", "<p:a/>"},
      {"undefined entity", "<a>&nope;</a>"},
      {"invalid UTF-8", "<a>\xFF</a>"},
      {"forbidden character reference", "<a>&#1;</a>"},
      {"control character in a namespace URI", "<a xmlns:p='x&#1;y'/>"},
      {"NUL byte", std::string("<a>\0</a>", 8)},
      {"lt in attribute value", "<a v='<'/>"},
      {"recursive entity", "<!DOCTYPE a [<!ENTITY e '&e;'>]><a>&e;</a>"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(ParseBytes(c.document).status, kXMLParseFailure) << c.what;
  }
}

TEST(ExpatEventsTest, EventsBeforeTheFaultAreDeliveredButNoEndDocument) {
  const ParseResult run = ParseBytes("<a><b>text</c></a>");
  EXPECT_EQ(run.status, kXMLParseFailure);
  EXPECT_EQ(run.events, (Events{"startdoc", "<a||a", "<b||b", "t:text"}));
}

TEST(ExpatEventsTest, LongTextArrivesInBoundedPiecesThatJoinUp) {
  std::string text;
  for (int i = 0; text.size() < 300 * 1024; ++i) text += "line " + std::to_string(i) + "\n";
  const ParseResult run = ParseBytes("<a>" + text + "</a>");
  ASSERT_EQ(run.status, kXMLParseSuccess);
  std::string joined;
  int pieces = 0;
  for (const std::string& event : run.events) {
    if (event.rfind("t:", 0) != 0) continue;
    ++pieces;
    EXPECT_LE(event.size(), 2u + 128 * 1024);
    joined += event.substr(2);
  }
  EXPECT_EQ(joined, text);
  EXPECT_GE(pieces, 3);
}

// More distinct names than the parser remembers: names past the limit still come out
// right, also when an element and its attribute are both new.
TEST(ExpatEventsTest, ManyDistinctNames) {
  std::string document = "<r xmlns:p='urn:p'>";
  for (int i = 0; i < 1500; ++i) {
    const std::string n = std::to_string(i);
    document += "<p:e" + n + " p:a" + n + "='" + n + "' b='x'/>";
  }
  document += "</r>";
  const ParseResult run = ParseBytes(document);
  ASSERT_EQ(run.status, kXMLParseSuccess);
  ASSERT_EQ(run.events.size(), 2u + 2 + 2 * 1500 + 2);
  for (int i : {0, 1023, 1024, 1499}) {
    const std::string n = std::to_string(i);
    EXPECT_EQ(run.events[3 + 2 * i],
              "<p:e" + n + "|urn:p|e" + n + " p:a" + n + "|urn:p|a" + n + "=" + n + " b||b=x");
    EXPECT_EQ(run.events[4 + 2 * i], "</p:e" + n + "|urn:p|e" + n);
  }
}

class ThrowingHandler : public RecordingHandler {
 public:
  using RecordingHandler::RecordingHandler;
  void StartElement(const UTF16String& name, const AttributeMap&) override {
    if (name == u"stop") throw std::runtime_error("stop here");
  }
  void StartElementWithNamespace(const UTF16String& q, const UTF16String& uri,
                                 const UTF16String& local, const AttributeVector& a) override {
    RecordingHandler::StartElementWithNamespace(q, uri, local, a);
    AbstractParseHandler::StartElementWithNamespace(q, uri, local, a);
  }
};

TEST(ExpatEventsTest, HandlerExceptionLeavesTheParseAndTheParserStaysUsable) {
  Events events;
  auto parser = ExpatParserFactory().GetParser(std::make_unique<ThrowingHandler>(&events));
  EXPECT_THROW(parser->ParseBuffer(Bytes("<a>x<stop/>y<b/></a>")), std::runtime_error);
  EXPECT_EQ(events, (Events{"startdoc", "<a||a", "t:x", "<stop||stop"}));

  events.clear();
  EXPECT_EQ(parser->ParseBuffer(Bytes("<a/>")), kXMLParseSuccess);
  EXPECT_EQ(events, (Events{"startdoc", "<a||a", "</a||a", "enddoc"}));
}

TEST(ExpatEventsTest, ParserWithoutHandlerStillChecksDocuments) {
  auto parser = ExpatParserFactory().GetParser(nullptr);
  ASSERT_NE(parser, nullptr);
  EXPECT_TRUE(parser->HasNamespaceSupport());
  EXPECT_EQ(parser->ParseBuffer(Bytes("<a>x</a>")), kXMLParseSuccess);
  EXPECT_EQ(parser->ParseBuffer(Bytes("<a>x</b>")), kXMLParseFailure);
}

}  // namespace
}  // namespace kelcore::xml
