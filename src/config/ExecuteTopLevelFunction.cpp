#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/ExecuteTopLevelFunction.h>

namespace kelcore::config {

template <>
void ExecuteTopLevelFunction<void>(boost::function0<void> function, bool* failed) {
  if (ErrorManager* manager = ErrorManager::Get(true); manager != nullptr) {
    const long result = manager->ExecuteFunctionWithTopLevelExceptionHandler([&function]() -> long {
      function();
      return 0;
    });
    if (failed != nullptr) *failed = result != 0;
    return;
  }
  if (failed != nullptr) *failed = false;
  try {
    function();
  } catch (...) {
    if (failed != nullptr) *failed = true;
  }
}

}  // namespace kelcore::config
