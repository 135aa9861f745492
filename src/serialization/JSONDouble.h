// Doubles in the writer's text form.
#pragma once

#include <cstddef>

namespace kelcore::serialization {

// Writes `value` as printf "%1.*lg" with precision 17 does, into `buffer` (at least 32
// bytes), and returns the end of the text.
char* FormatJSONDouble(double value, char* buffer, std::size_t size);

}  // namespace kelcore::serialization
