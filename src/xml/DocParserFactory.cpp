#include <kelcore/xml/DocParserFactory.h>

namespace kelcore::xml {

DocParserFactory::~DocParserFactory() = default;

}  // namespace kelcore::xml
