// The parser factory over Expat, the platform factory on every platform (see
// DefaultParserFactory.h).
//
// Its parsers (HasNamespaceSupport: true) deliver the namespace forms of the element
// events: qualified names as written (prefix ":" local name), namespace URIs and local
// names, attributes in document order followed by those defaulted by the DTD, without
// the namespace declarations, which arrive as StartPrefixMapping/EndPrefixMapping around
// the element. They report CDATA sections and comments. Text is delivered merged: the
// character data between two pieces of markup (an element tag, a comment, a CDATA
// boundary, a processing instruction) arrives in one Characters call, entity and
// character references expanded and line ends normalised to line feeds. Text is held
// back up to 64 KiB of UTF-8 at a time, so a longer run may arrive in several calls. Processing
// instructions, the XML and document type declarations and whitespace after the root element are
// not reported.
//
// Reading: ParseDocument reads the file in pieces of 64 KiB, so a document of any size
// streams; ParseBuffer parses the bytes in place. The encoding comes from the byte-order
// mark or the XML declaration (UTF-8, UTF-16, ISO-8859-1 and US-ASCII), UTF-8 by default.
//
// Security: nothing outside the document is ever read. External general entities are
// skipped (their references produce no events), external DTD subsets and parameter
// entities are not loaded, and a document whose entity expansion grows its output past
// a hundred times its input (checked once the output passes 1 MiB) fails with
// kXMLParseFailure. Text that the document itself declares in its internal subset is
// expanded normally.
//
// Statuses: kXMLParseSuccess when the whole document parsed; kXMLParseFailure, with no
// events at all, when the file cannot be opened or Expat cannot be set up, and after the
// events up to the fault when the document is not well formed, uses an undeclared entity,
// is refused as above, or the file cannot be read to its end. StartDocument comes once
// the input is open; EndDocument only after a successful parse. A handler that throws
// stops the parse: the exception leaves ParseDocument/ParseBuffer and no further event
// is delivered.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/xml/DocParserFactory.h>

namespace kelcore::xml {

class KELCORE_API ExpatParserFactory : public DocParserFactory {
 public:
  ExpatParserFactory() = default;
  ~ExpatParserFactory() override;

  // Never returns an empty pointer; std::bad_alloc passes.
  std::unique_ptr<AbstractDocParser> GetParser(
      std::unique_ptr<AbstractParseHandler> handler) override;
};

}  // namespace kelcore::xml
