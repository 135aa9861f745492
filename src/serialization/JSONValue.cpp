// The one exported null marker.
#include <kelcore/serialization/JSONValue.h>

namespace kelcore::serialization {

const NullType G_NullType{};

}  // namespace kelcore::serialization
