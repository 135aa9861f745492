// The two shapes in which a parser hands an element's attributes to a handler.
#pragma once

#include <map>
#include <vector>

#include <kelcore/utility/StringTypes.h>

namespace kelcore::xml {

// One attribute with its namespace information, as the namespace-aware events deliver
// it. An attribute without a prefix belongs to no namespace: its URI is empty and its
// local name equals its qualified name. Namespace declarations (xmlns, xmlns:p) are not
// attributes and never appear.
struct Attribute {
  UTF16String qualifiedName;  // prefix ":" local name, or the local name alone
  UTF16String namespaceURI;
  UTF16String localName;
  UTF16String value;  // after entity expansion and attribute-value normalisation
};

using AttributeVector = std::vector<Attribute>;

// The attributes of the plain StartElement event: qualified name to value, sorted by
// code unit. Built from an AttributeVector in its order with insertion that keeps the
// first value, so of two attributes with the same qualified name the earlier one wins.
using AttributeMap = std::map<UTF16String, UTF16String>;

}  // namespace kelcore::xml
