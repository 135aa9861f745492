// The receiver of a document's events. A client derives from it and overrides what it
// needs; a parser (AbstractDocParser) owns the handler and calls it on the thread that
// runs the parse, one event at a time.
//
// Every operation has a default body that does nothing, except the two namespace forms,
// which forward to the plain ones. A handler therefore overrides either the plain pair
// (StartElement/EndElement) or the namespace pair, and receives every element either way.
//
// Order of events for one document: StartDocument first; then, in document order,
// StartPrefixMapping for each namespace declaration of an element before that element's
// start, the element's start, its content, its end, then EndPrefixMapping for its
// declarations; Characters for text (also inside CDATA sections, between StartCDATA and
// EndCDATA); Comment for comments anywhere in the document, the DTD's internal subset
// included; EndDocument last, and only when the whole document parsed.
//
// A handler stops a parse only by throwing: the parser abandons the document and the
// exception leaves ParseDocument or ParseBuffer unchanged.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>
#include <kelcore/xml/Attribute.h>

namespace kelcore::xml {

class KELCORE_API AbstractParseHandler {
 public:
  virtual ~AbstractParseHandler() = 0;

  virtual void StartDocument();
  virtual void StartElement(const UTF16String& name, const AttributeMap& attributes);
  // By default: builds the map from `attributes` in their order (an attribute whose
  // qualified name is already in the map is left out) and calls
  // StartElement(qualifiedName, map).
  virtual void StartElementWithNamespace(const UTF16String& qualifiedName,
                                         const UTF16String& namespaceURI,
                                         const UTF16String& localName,
                                         const AttributeVector& attributes);
  virtual void EndElement(const UTF16String& name);
  // By default: calls EndElement(qualifiedName).
  virtual void EndElementWithNamespace(const UTF16String& qualifiedName,
                                       const UTF16String& namespaceURI,
                                       const UTF16String& localName);
  virtual void StartCDATA();
  virtual void EndCDATA();
  // A piece of text. One run of text may arrive in more than one call: append.
  virtual void Characters(const UTF16String& text);
  virtual void Comment(const UTF16String& text);
  virtual void EndDocument();
  // `prefix` is empty for the default namespace; `uri` is empty when a declaration
  // xmlns="" undeclares it.
  virtual void StartPrefixMapping(const UTF16String& prefix, const UTF16String& uri);
  virtual void EndPrefixMapping(const UTF16String& prefix);
};

}  // namespace kelcore::xml
