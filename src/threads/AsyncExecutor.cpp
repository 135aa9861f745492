#include <kelcore/threads/AsyncExecutor.h>

namespace kelcore::threads {

AsyncExecutor::~AsyncExecutor() = default;

AsyncThreadedExecutor::AsyncThreadedExecutor() = default;

AsyncThreadedExecutor::~AsyncThreadedExecutor() = default;

}  // namespace kelcore::threads
