// The nodes that hold one value: a string, a bool or a number.
//
// One class template serves all ten types; the names below are the ones the rest of the
// library uses. Despite its name, SimpleTypeArrayNode<T> holds a single number: arrays
// are PropListArrayNode over these nodes.
#pragma once

#include "NodeValueTraits.h"
#include "XMLValueElements.h"

#include <kelcore/proplist/PropNodeBase.h>

#include <memory>

namespace kelcore::proplist {

template <class T>
class ValuePropNode final : public PropNodeBase {
 public:
  using value_type = T;
  static constexpr PropListPropertyType kType = NodeValueTraits<T>::kType;

  explicit ValuePropNode(const T& value) : value_(value) {}

  void OutputAsXML(UTF8String& out) const override { AppendValueElement(value_, out); }
  PropListPropertyType GetType() const override { return kType; }
  std::unique_ptr<PropNodeBase> Clone() const override {
    return std::make_unique<ValuePropNode>(*this);
  }

  const T& Value() const { return value_; }
  void Get(T& value) const { value = value_; }
  void Set(const T& value) { value_ = value; }

  bool operator==(const ValuePropNode& other) const {
    return NodeValueTraits<T>::Same(value_, other.value_);
  }

 private:
  T value_;
};

using UnicodeStringPropNode = ValuePropNode<UTF16String>;
using StringPropNode = ValuePropNode<UTF8String>;
using BoolPropNode = ValuePropNode<bool>;
template <class T>
using SimpleTypeArrayNode = ValuePropNode<T>;

}  // namespace kelcore::proplist
