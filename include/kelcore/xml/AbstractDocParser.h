// A parser: reads one document at a time and feeds its events to the handler it owns.
// Parsers come from the installed DocParserFactory (see ParserFactorySlot.h).
//
// A parser is not shared between threads: one thread at a time may call it, and the
// handler's events run on that thread. One parser may parse any number of documents in
// turn; each call is self-contained and keeps no state of the previous one.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>
#include <kelcore/xml/AbstractParseHandler.h>

namespace kelcore::xml {

// The result of a parse. Only two values occur: callers test for kXMLParseSuccess.
using XMLParseStatus = int;
inline constexpr XMLParseStatus kXMLParseSuccess = 0;
// Any failure: the input could not be opened or read, the parser could not be set up,
// or the document is not well formed or was refused. No detail is kept.
inline constexpr XMLParseStatus kXMLParseFailure = 10;

class KELCORE_API AbstractDocParser {
 public:
  // Destroys the owned handler.
  virtual ~AbstractDocParser();

  // Whether the parser delivers the namespace forms of the element events with real
  // namespace information. The base answers false.
  virtual bool HasNamespaceSupport() const;

  // Parses the file at `path` (a file-system path, not a URL).
  virtual XMLParseStatus ParseDocument(const UTF16String& path) = 0;
  // Parses a whole document held in memory as raw bytes, in whatever encoding its
  // byte-order mark or XML declaration names (UTF-8 when neither does).
  virtual XMLParseStatus ParseBuffer(const UTF8String& bytes) = 0;

 protected:
  // Takes the handler over; it may be empty, in which case documents are still checked
  // and the events go nowhere.
  explicit AbstractDocParser(std::unique_ptr<AbstractParseHandler> handler);

  // Copying transfers ownership: the handler moves over and `source` is left without one.
  AbstractDocParser(AbstractDocParser& source);
  AbstractDocParser& operator=(AbstractDocParser& source);

  // The owned handler, or null.
  AbstractParseHandler* Handler() const { return handler_.get(); }

 private:
  std::unique_ptr<AbstractParseHandler> handler_;
};

}  // namespace kelcore::xml
