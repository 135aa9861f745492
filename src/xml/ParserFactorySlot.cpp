#include <kelcore/xml/ParserFactorySlot.h>

#include <utility>

namespace kelcore::xml {
namespace {

// Constant-initialised, so it is empty before any constructor of the host runs;
// destroyed with the library's other statics at process exit.
constinit std::unique_ptr<DocParserFactory> gFactory;

}  // namespace

void SetParserFactory(std::unique_ptr<DocParserFactory> factory) {
  if (factory != nullptr && factory.get() == gFactory.get()) {
    // Already installed and owned here: keep the slot's ownership, drop the duplicate.
    static_cast<void>(factory.release());
    return;
  }
  // Swap first, so the old factory's destructor sees the new one installed.
  std::swap(gFactory, factory);
}

void ResetParserFactory() {
  gFactory.reset();
}

bool Initialized() {
  return gFactory != nullptr;
}

std::unique_ptr<AbstractDocParser> GetParser(std::unique_ptr<AbstractParseHandler>&& handler) {
  DocParserFactory* factory = gFactory.get();
  if (factory == nullptr) return nullptr;
  return factory->GetParser(std::move(handler));
}

}  // namespace kelcore::xml
