// The node that holds a nested PropList, which it owns; destroying the node destroys
// the list, and cloning it copies the list deeply.
#pragma once

#include <kelcore/proplist/PropList.h>
#include <kelcore/proplist/PropNodeBase.h>

#include <memory>

namespace kelcore::proplist {

class PropListNode final : public PropNodeBase {
 public:
  static constexpr PropListPropertyType kType = kPropTypePropList;

  // Holds a new empty list of the current version.
  PropListNode() = default;

  // The nested list's fragment; a nested list carries no version of its own.
  void OutputAsXML(UTF8String& out) const override { list_.OutputAsXMLFragment(out); }
  PropListPropertyType GetType() const override { return kType; }
  std::unique_ptr<PropNodeBase> Clone() const override {
    return std::make_unique<PropListNode>(*this);
  }

  PropList& List() { return list_; }
  const PropList& List() const { return list_; }

  bool operator==(const PropListNode& other) const { return list_ == other.list_; }

 private:
  PropList list_;
};

}  // namespace kelcore::proplist
