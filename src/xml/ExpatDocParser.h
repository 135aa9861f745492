// The parser that ExpatParserFactory makes; its behaviour is described in
// <kelcore/xml/ExpatParserFactory.h>. Each parse runs its own ExpatSession.
#pragma once

#include <memory>

#include <kelcore/xml/AbstractDocParser.h>

namespace kelcore::xml {

class ExpatDocParser final : public AbstractDocParser {
 public:
  explicit ExpatDocParser(std::unique_ptr<AbstractParseHandler> handler);
  ~ExpatDocParser() override;

  bool HasNamespaceSupport() const override;
  XMLParseStatus ParseDocument(const UTF16String& path) override;
  XMLParseStatus ParseBuffer(const UTF8String& bytes) override;

 private:
  // The owned handler, or one that ignores every event when there is none.
  AbstractParseHandler& Target() const;
};

}  // namespace kelcore::xml
