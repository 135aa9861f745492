// The node that holds an array: an ordered list of element nodes of one class N (one of
// the ValuePropNode classes). An array may be empty; its type still says what it holds.
#pragma once

#include "NodeValueTraits.h"
#include "XMLValueElements.h"

#include <kelcore/proplist/PropNodeBase.h>

#include <algorithm>
#include <list>
#include <memory>
#include <vector>

namespace kelcore::proplist {

template <class N>
class PropListArrayNode final : public PropNodeBase {
 public:
  using element_type = typename N::value_type;
  static constexpr PropListPropertyType kType = NodeValueTraits<element_type>::kArrayType;

  explicit PropListArrayNode(const std::list<element_type>& values) { Set(values); }

  // "<array>", the element type's empty tag inside "<array.type>", each element's
  // element, "</array>".
  void OutputAsXML(UTF8String& out) const override {
    AppendAscii("<array>\n<array.type>", out);
    AppendAscii(NodeValueTraits<element_type>::kEmptyTag, out);
    AppendAscii("</array.type>\n", out);
    for (const N& element : elements_) element.OutputAsXML(out);
    AppendAscii("</array>\n", out);
  }
  PropListPropertyType GetType() const override { return kType; }
  std::unique_ptr<PropNodeBase> Clone() const override {
    return std::make_unique<PropListArrayNode>(*this);
  }

  // Appends the elements in order to `values`; on failure `values` is unchanged.
  void Get(std::list<element_type>& values) const {
    std::list<element_type> tail;
    for (const N& element : elements_) tail.push_back(element.Value());
    values.splice(values.end(), tail);
  }
  // Replaces the elements by new element nodes holding `values` in order; on failure
  // the old elements are kept.
  void Set(const std::list<element_type>& values) {
    std::vector<N> fresh;
    fresh.reserve(values.size());
    for (const element_type& value : values) fresh.emplace_back(value);
    elements_.swap(fresh);
  }

  bool operator==(const PropListArrayNode& other) const {
    return std::equal(elements_.begin(), elements_.end(), other.elements_.begin(),
                      other.elements_.end());
  }

 private:
  std::vector<N> elements_;
};

}  // namespace kelcore::proplist
