#include <kelcore/xml/DefaultParserFactory.h>

#include <kelcore/xml/ExpatParserFactory.h>

namespace kelcore::xml {

std::unique_ptr<DocParserFactory> CreateDefaultParserFactory() {
  return std::make_unique<ExpatParserFactory>();
}

}  // namespace kelcore::xml
