#include <kelcore/xml/AbstractDocParser.h>

#include <utility>

namespace kelcore::xml {

AbstractDocParser::AbstractDocParser(std::unique_ptr<AbstractParseHandler> handler)
    : handler_(std::move(handler)) {}

AbstractDocParser::AbstractDocParser(AbstractDocParser& source)
    : handler_(std::move(source.handler_)) {}

AbstractDocParser& AbstractDocParser::operator=(AbstractDocParser& source) {
  if (this != &source) handler_ = std::move(source.handler_);
  return *this;
}

AbstractDocParser::~AbstractDocParser() = default;

bool AbstractDocParser::HasNamespaceSupport() const {
  return false;
}

}  // namespace kelcore::xml
