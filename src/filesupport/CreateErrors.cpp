#include "filesupport/CreateErrors.h"

#include <kelcore/filesupport/FileExceptions.h>

namespace kelcore::filesupport::detail {

void ThrowCreateError(const File& file, unsigned long code) {
  switch (code) {
    case 2:
    case 6:
    case 18:
    case 107:
      throw create_fnf_exception(file);
    case 3:
      throw create_invalidpath_exception(file);
    case 5:
    case 12:
    case 29:
    case 54:
    case 58:
    case 64:
    case 65:
    case 71:
    case 80:
    case 82:
    case 86:
    case 170:
    case 183:
    case 999:
      throw create_accessdenied_exception(file);
    case 19:
      throw create_locked_exception(file);
    default:
      throw create_exception(file);
  }
}

}  // namespace kelcore::filesupport::detail
