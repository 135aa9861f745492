// The process-wide parser factory: one owned DocParserFactory, empty at load, destroyed
// at process exit.
//
// The slot is a plain global without a lock. The host installs the factory once at
// start-up, before any thread parses, and resets it (if at all) at shut-down after the
// last parse; while no thread changes it, any number of threads may call Initialized and
// GetParser at once.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/xml/AbstractDocParser.h>
#include <kelcore/xml/AbstractParseHandler.h>
#include <kelcore/xml/DocParserFactory.h>

namespace kelcore::xml {

// Installs `factory`, destroying the one installed before. Installing the object that is
// already installed (a pointer released from elsewhere) keeps it and destroys nothing.
// An empty pointer empties the slot, as ResetParserFactory does.
KELCORE_API void SetParserFactory(std::unique_ptr<DocParserFactory> factory);

// Destroys the installed factory, if any; none is installed afterwards.
KELCORE_API void ResetParserFactory();

// Whether a factory is installed.
KELCORE_API bool Initialized();

// A parser for `handler` from the installed factory. The handler moves into the parser
// only when a factory is installed: with none, the result is empty, nothing is raised,
// and `handler` still owns what it owned (so GetParser(std::move(h)) leaves h intact).
// Callers must check for an empty result. Exceptions from the factory (std::bad_alloc)
// pass through; the handler is then consumed.
KELCORE_API std::unique_ptr<AbstractDocParser> GetParser(
    std::unique_ptr<AbstractParseHandler>&& handler);

}  // namespace kelcore::xml
