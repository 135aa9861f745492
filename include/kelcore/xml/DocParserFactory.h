// The maker of parsers. One factory is installed process-wide (ParserFactorySlot.h);
// CreateDefaultParserFactory (DefaultParserFactory.h) gives the platform's own.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/xml/AbstractDocParser.h>
#include <kelcore/xml/AbstractParseHandler.h>

namespace kelcore::xml {

class KELCORE_API DocParserFactory {
 public:
  DocParserFactory() = default;
  DocParserFactory(const DocParserFactory&) = default;
  DocParserFactory& operator=(const DocParserFactory&) = default;
  virtual ~DocParserFactory();

  // A new parser that owns `handler`. An implementation may be called from any thread at
  // once and must keep no state between calls that needs a lock.
  virtual std::unique_ptr<AbstractDocParser> GetParser(
      std::unique_ptr<AbstractParseHandler> handler) = 0;
};

}  // namespace kelcore::xml
