#include <kelcore/proplist/PropNodeBase.h>

namespace kelcore::proplist {

PropNodeBase::~PropNodeBase() = default;

}  // namespace kelcore::proplist
