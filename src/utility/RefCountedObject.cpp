#include <kelcore/utility/RefCountedObject.h>

namespace kelcore::utility {

// Out of line so that the class's virtual table lives in the library alone.
RefCountedObject::~RefCountedObject() = default;

}  // namespace kelcore::utility
