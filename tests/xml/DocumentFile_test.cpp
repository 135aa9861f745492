// Documents whose file names are not valid UTF-8 open through the same path encoding as
// the files module uses, so a name found by a directory listing parses.
#include <kelcore/filesupport/File.h>
#include <kelcore/xml/ExpatParserFactory.h>

#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "RecordingHandler.h"
#include "TemporaryDirectory.h"

namespace kelcore::xml {
namespace {

TEST(DocumentFileTest, NamesThatAreNotUtf8RoundTrip) {
  test_support::TemporaryDirectory dir;
  // Latin-1 bytes, a stray continuation byte and an encoded surrogate: each is kept as
  // an escaped unit in the UTF-16 path and must reach the system as the same bytes.
  for (const std::string name : {"caf\xE9.xml", "a\x80\xFF.xml", "s\xED\xA0\x80.xml"}) {
    const std::string bytes = dir.Write(name, "<r>x</r>");
    const UTF16String path = filesupport::File(bytes).FullPath();
    std::vector<std::string> events;
    auto parser =
        ExpatParserFactory().GetParser(std::make_unique<test_support::RecordingHandler>(&events));
    EXPECT_EQ(parser->ParseDocument(path), kXMLParseSuccess) << name;
    EXPECT_EQ(events.size(), 5u) << name;
  }
}

}  // namespace
}  // namespace kelcore::xml
