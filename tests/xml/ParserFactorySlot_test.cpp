#include <kelcore/xml/ParserFactorySlot.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>
#include <kelcore/xml/DefaultParserFactory.h>

#include "RecordingHandler.h"

namespace kelcore::xml {
namespace {

using test_support::Bytes;
using test_support::Narrow;

// Counts live objects, so ownership hand-overs can be observed.
struct Lifetimes {
  int factories = 0;
  int handlers = 0;
};

class CountedHandler : public AbstractParseHandler {
 public:
  explicit CountedHandler(Lifetimes* lives) : lives_(lives) { ++lives_->handlers; }
  ~CountedHandler() override { --lives_->handlers; }

 private:
  Lifetimes* lives_;
};

class StubParser : public AbstractDocParser {
 public:
  explicit StubParser(std::unique_ptr<AbstractParseHandler> handler)
      : AbstractDocParser(std::move(handler)) {}
  StubParser(StubParser& source) = default;
  StubParser& operator=(StubParser& source) = default;
  XMLParseStatus ParseDocument(const UTF16String&) override { return kXMLParseFailure; }
  XMLParseStatus ParseBuffer(const UTF8String&) override { return kXMLParseFailure; }
  bool Owns() const { return Handler() != nullptr; }
};

class CountedFactory : public DocParserFactory {
 public:
  explicit CountedFactory(Lifetimes* lives) : lives_(lives) { ++lives_->factories; }
  ~CountedFactory() override { --lives_->factories; }
  std::unique_ptr<AbstractDocParser> GetParser(
      std::unique_ptr<AbstractParseHandler> handler) override {
    return std::make_unique<StubParser>(std::move(handler));
  }

 private:
  Lifetimes* lives_;
};

class ParserFactorySlotTest : public ::testing::Test {
 protected:
  void TearDown() override { ResetParserFactory(); }
  Lifetimes lives_;
};

TEST_F(ParserFactorySlotTest, ReplacingOrResettingDestroysTheInstalledFactory) {
  EXPECT_FALSE(Initialized());
  auto first = std::make_unique<CountedFactory>(&lives_);
  CountedFactory* raw = first.get();
  SetParserFactory(std::move(first));
  EXPECT_EQ(first, nullptr);
  EXPECT_TRUE(Initialized());
  SetParserFactory(std::unique_ptr<DocParserFactory>(raw));  // the same object again: kept
  EXPECT_EQ(lives_.factories, 1);

  SetParserFactory(std::make_unique<CountedFactory>(&lives_));
  EXPECT_EQ(lives_.factories, 1);  // the first is gone
  EXPECT_TRUE(Initialized());

  ResetParserFactory();
  EXPECT_EQ(lives_.factories, 0);
  EXPECT_FALSE(Initialized());
}

TEST_F(ParserFactorySlotTest, WithoutFactoryGetParserKeepsTheHandler) {
  std::unique_ptr<AbstractParseHandler> handler = std::make_unique<CountedHandler>(&lives_);
  EXPECT_EQ(GetParser(std::move(handler)), nullptr);
  EXPECT_NE(handler, nullptr);
  EXPECT_EQ(lives_.handlers, 1);
}

TEST_F(ParserFactorySlotTest, ParserOwnsTheHandlerAndCopyingTransfersIt) {
  SetParserFactory(std::make_unique<CountedFactory>(&lives_));
  std::unique_ptr<AbstractParseHandler> handler = std::make_unique<CountedHandler>(&lives_);
  std::unique_ptr<AbstractDocParser> parser = GetParser(std::move(handler));
  ASSERT_NE(parser, nullptr);
  EXPECT_EQ(handler, nullptr);
  EXPECT_FALSE(parser->HasNamespaceSupport());

  auto& source = static_cast<StubParser&>(*parser);
  StubParser copy(source);
  EXPECT_FALSE(source.Owns());
  EXPECT_TRUE(copy.Owns());
  source = copy;
  EXPECT_TRUE(source.Owns());
  EXPECT_FALSE(copy.Owns());
  EXPECT_EQ(lives_.handlers, 1);
  parser.reset();
  EXPECT_EQ(lives_.handlers, 0);
}

// A handler that overrides only the plain element pair.
class PlainHandler : public AbstractParseHandler {
 public:
  void StartElement(const UTF16String& name, const AttributeMap& attributes) override {
    std::string line = "<" + Narrow(name);
    for (const auto& [key, value] : attributes) {
      line += " " + Narrow(key) + "=" + Narrow(value);
    }
    events.push_back(line);
  }
  void EndElement(const UTF16String& name) override { events.push_back("</" + Narrow(name)); }
  std::vector<std::string> events;
};

TEST(AbstractParseHandlerTest, NamespaceFormsForwardToThePlainPair) {
  PlainHandler handler;
  const AttributeVector attributes = {
      {u"p:z", u"urn:p", u"z", u"1"}, {u"b", u"", u"b", u"2"}, {u"p:z", u"urn:q", u"z", u"3"}};
  handler.StartElementWithNamespace(u"p:e", u"urn:p", u"e", attributes);
  handler.EndElementWithNamespace(u"p:e", u"urn:p", u"e");
  // Sorted by name; of the duplicated name the first value stays.
  EXPECT_EQ(handler.events, (std::vector<std::string>{"<p:e b=2 p:z=1", "</p:e"}));
}

TEST(AbstractParseHandlerTest, PlainHandlerReceivesEveryParsedElement) {
  std::unique_ptr<AbstractParseHandler> owned = std::make_unique<PlainHandler>();
  auto* handler = static_cast<PlainHandler*>(owned.get());
  auto parser = CreateDefaultParserFactory()->GetParser(std::move(owned));
  ASSERT_EQ(parser->ParseBuffer(Bytes("<r xmlns:p='urn:p'><p:c p:k='v' a='b'/></r>")),
            kXMLParseSuccess);
  EXPECT_EQ(handler->events, (std::vector<std::string>{"<r", "<p:c a=b p:k=v", "</p:c", "</r"}));
}

}  // namespace
}  // namespace kelcore::xml
