// PropListXMLHandler: the parse handler that reads a property list document into a
// PropList. It is driven by any parser of the XML framework (see
// <kelcore/xml/ParserFactorySlot.h>); LoadPropList and ReadPropList in
// <kelcore/proplist/PropListUtils.h> are the usual way to use it.
//
// The reader is lenient: whatever still parses as XML is read as far as it makes
// sense and never raises an error of its own, except for a version that is too new.
//   - Element names are compared exactly (case-sensitive, namespace prefix included).
//   - prop.map: its version attribute (read as an unsigned 16-bit number, 0 when it is
//     not one) becomes the list's version; without it the version is left alone. A
//     version above PropList::GetCurrentVersion() raises, through ThrowError, the
//     non-fatal error "$$$/kelcore/proplist/Error/PropListXMLHandler/VersionGreaterThan=
//     Cannot read PropList data; version greater than expected." (component 104, error
//     number 1, deferral allowed). If the host's error manager defers it instead of
//     throwing, the handler throws PropListVersionRefused to end the parse.
//   - The first prop.list is the target list; a prop.list inside it is the nested list
//     (NewSubList) under the key read last.
//   - key collects the key; a value element (ustring, string, float, double, true, bool,
//     false, and int with non-empty type and size attributes) collects a value, stored
//     under the key when the element ends. An int whose size is not 16, 32 or 64 is
//     still a value but keeps the kind of the value element read before it. A value
//     element before any key is stored under the empty key. Numbers are read as a
//     classic-locale stream reads them: an unparsable number gives 0, an out-of-range
//     one the type's largest or smallest value.
//   - array holds value elements, stored as one list of the kind of its last element
//     (a bool element is true when its text is "true"); array.type names the element
//     type so that an empty array keeps its type.
//   - Text outside keys and values, and unknown elements, are ignored. Text is taken up
//     to its first NUL.
// The handler keeps non-owning pointers to the target list and its nested lists: the
// target must outlive the parse. One handler serves one parse at a time, on one thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/proplist/PropList.h>
#include <kelcore/utility/StringTypes.h>
#include <kelcore/xml/AbstractParseHandler.h>

#include <cstdint>
#include <exception>
#include <vector>

namespace kelcore::proplist {

// Thrown by the handler to end a parse when the error manager deferred the version
// error instead of throwing it; the error has been reported already.
class KELCORE_API PropListVersionRefused : public std::exception {
 public:
  const char* what() const noexcept override;
};

class KELCORE_API PropListXMLHandler : public xml::AbstractParseHandler {
 public:
  // What a value element holds.
  enum class ValueKind : std::uint8_t {
    kNone,
    kUTF16Text,  // ustring
    kUTF8Text,   // string
    kFloat,
    kDouble,
    kBoolTrue,  // true, bool
    kBoolFalse,
    kUInt16,
    kUInt32,
    kInt32,
    kInt64,
    kUInt64,
  };

  // Reads into `target`, which is not cleared first.
  explicit PropListXMLHandler(PropList& target);
  ~PropListXMLHandler() override;

  void StartElement(const UTF16String& name, const xml::AttributeMap& attributes) override;
  void EndElement(const UTF16String& name) override;
  void Characters(const UTF16String& text) override;
  void EndDocument() override;

  // The same as the plain forms (the first of attributes sharing a qualified name counts),
  // without building the attribute map.
  void StartElementWithNamespace(const UTF16String& qualifiedName, const UTF16String& namespaceURI,
                                 const UTF16String& localName,
                                 const xml::AttributeVector& attributes) override;
  void EndElementWithNamespace(const UTF16String& qualifiedName, const UTF16String& namespaceURI,
                               const UTF16String& localName) override;

 private:
  enum class Collecting : std::uint8_t { kIdle = 0, kKey = 1, kValue = 2 };

  // `attribute(name)` gives the value of the attribute of that qualified name, or null.
  template <class AttributeLookup>
  void OnStart(const UTF16String& name, AttributeLookup attribute);
  void ReadVersion(const UTF16String* version);
  void StoreScalar();
  void StoreArray();
  const UTF8String& KeyUTF8();

  PropList* target_;
  UTF16String keyText_;
  UTF16String valueText_;
  std::vector<PropList*> openLists_;
  PropList* current_ = nullptr;
  Collecting collecting_ = Collecting::kIdle;
  ValueKind valueKind_ = ValueKind::kNone;
  bool inArray_ = false;
  std::vector<UTF16String> arrayTexts_;
  bool inArrayType_ = false;
  ValueKind arrayTypeKind_ = ValueKind::kNone;
  bool arrayTypeRecognised_ = false;
  // Reused for conversions, so that reading a long document does not allocate per value:
  // the key and a number's text in UTF-8.
  UTF8String scratch_;
  UTF8String number_;
};

}  // namespace kelcore::proplist
