// The abstract value node that a PropList keeps under each key.
//
// Clients never see nodes: they read and write values through PropList. The node
// classes (one per kind of value, all inside the library) exist so that the list can own
// values of twenty-one types behind one pointer, copy them deeply and write them as XML.
// The class is public only because PropList holds nodes by value of this base.
//
// The order of the virtual functions below is part of the interface and must not change:
// destructor, OutputAsXML, GetType, Clone.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/proplist/PropListPropertyType.h>
#include <kelcore/utility/StringTypes.h>

#include <memory>

namespace kelcore::proplist {

class KELCORE_API PropNodeBase {
 public:
  virtual ~PropNodeBase();

  // Appends this value's XML element(s), each line ending in a line feed, to `out`.
  virtual void OutputAsXML(UTF8String& out) const = 0;
  // The type number of the value held; never kPropTypeNone.
  virtual PropListPropertyType GetType() const = 0;
  // A new node holding a deep copy of this one's value; it shares nothing with this node.
  virtual std::unique_ptr<PropNodeBase> Clone() const = 0;

 protected:
  PropNodeBase() = default;
  PropNodeBase(const PropNodeBase&) = default;
  PropNodeBase& operator=(const PropNodeBase&) = default;
};

}  // namespace kelcore::proplist
