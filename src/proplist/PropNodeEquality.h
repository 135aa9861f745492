// Value comparison of two nodes of any classes.
#pragma once

#include <kelcore/proplist/PropNodeBase.h>

namespace kelcore::proplist {

// True when both nodes hold the same type and equal values (floats and doubles by bit
// pattern, nested lists entry by entry, arrays element by element).
bool NodesEqual(const PropNodeBase& a, const PropNodeBase& b);

}  // namespace kelcore::proplist
