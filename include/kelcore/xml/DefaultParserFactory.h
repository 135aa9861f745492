// The platform's parser factory, for the host to install at start-up:
//   kelcore::xml::SetParserFactory(kelcore::xml::CreateDefaultParserFactory());
//
// It is the ExpatParserFactory on every platform: Expat is portable, so documents give
// the same events, statuses and security limits everywhere.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/xml/DocParserFactory.h>

namespace kelcore::xml {

// A new factory, owned by the caller. std::bad_alloc passes.
KELCORE_API std::unique_ptr<DocParserFactory> CreateDefaultParserFactory();

}  // namespace kelcore::xml
