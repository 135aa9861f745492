#include <kelcore/xml/ExpatParserFactory.h>

#include <utility>

#include "xml/ExpatDocParser.h"

namespace kelcore::xml {

ExpatParserFactory::~ExpatParserFactory() = default;

std::unique_ptr<AbstractDocParser> ExpatParserFactory::GetParser(
    std::unique_ptr<AbstractParseHandler> handler) {
  return std::make_unique<ExpatDocParser>(std::move(handler));
}

}  // namespace kelcore::xml
