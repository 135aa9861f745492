// Running a function under a top-level exception handler, as a thread's or a
// callback's outermost frame does.
#pragma once

#include <kelcore/Export.h>

#include <boost/function.hpp>

namespace kelcore::config {

// Only the void form exists: ExecuteTopLevelFunction<void>(f, &failed).
template <class Result>
Result ExecuteTopLevelFunction(boost::function0<Result> function, bool* failed) = delete;

// Runs `function`. With a manager installed, the function runs through the manager's
// ExecuteFunctionWithTopLevelExceptionHandler, which decides what the user sees and
// what escapes (the base class lets nothing escape), and `*failed` becomes true when
// that returns non-zero, the base class's sign of a caught exception. With none
// installed, an exception of any type is caught and swallowed, and `*failed` says
// whether one was. `failed` may be null. An empty function fails like one that throws.
// Any thread.
template <>
KELCORE_API void ExecuteTopLevelFunction<void>(boost::function0<void> function, bool* failed);

}  // namespace kelcore::config
