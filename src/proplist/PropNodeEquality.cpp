#include "PropNodeEquality.h"

#include "PropListArrayNode.h"
#include "PropListNode.h"
#include "ValuePropNode.h"

#include <cstdint>

namespace kelcore::proplist {
namespace {

template <class N>
bool EqualAs(const PropNodeBase& a, const PropNodeBase& b) {
  return static_cast<const N&>(a) == static_cast<const N&>(b);
}

// Compares two nodes of type `type` as the one class N whose type number it is.
template <class... N>
struct NodeClasses {
  static bool Equal(PropListPropertyType type, const PropNodeBase& a, const PropNodeBase& b) {
    bool equal = false;
    static_cast<void>(((type == N::kType ? (equal = EqualAs<N>(a, b), true) : false) || ...));
    return equal;
  }
};

template <class... T>
using ScalarAndArrayClasses =
    NodeClasses<ValuePropNode<T>..., PropListArrayNode<ValuePropNode<T>>..., PropListNode>;

using AllNodeClasses =
    ScalarAndArrayClasses<UTF16String, UTF8String, bool, std::uint16_t, std::uint32_t, std::int32_t,
                          std::int64_t, std::uint64_t, float, double>;

}  // namespace

bool NodesEqual(const PropNodeBase& a, const PropNodeBase& b) {
  const PropListPropertyType type = a.GetType();
  return type == b.GetType() && AllNodeClasses::Equal(type, a, b);
}

}  // namespace kelcore::proplist
