// Periodic work on any executor: a function called again and again with a delay before
// each call, until it says stop or its owner does.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/AsyncExecutor.h>

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

namespace kelcore::threads {

// Calls `fn` on `executor` after `delayMilliseconds`, and again after each further
// delay for as long as `fn` returns true; the first call comes after one delay, not at
// once. Each step holds the executor weakly: once it is gone (or refuses the next step,
// as a terminated executor does), the repetition ends. An empty executor or function
// does nothing. An exception escaping `fn` ends the repetition and is left to the
// executor's own handling. Any thread.
KELCORE_API void CallConditionalRepeatDelayFunctionAsynchronously(
    const boost::shared_ptr<AsyncExecutor>& executor, const boost::function<bool()>& fn,
    unsigned int delayMilliseconds);

// Calls a function on an executor every `delayMilliseconds` (first after one delay)
// until DoNotCallAgain() or destruction. The scheduled steps hold the function weakly:
// after DoNotCallAgain the next step finds it gone and the repetition stops, while a
// call already running is not interrupted. Construct, stop and destroy on one thread;
// the function runs on the executor's threads.
class KELCORE_API RepeatDelayFunction {
 public:
  RepeatDelayFunction(const boost::shared_ptr<AsyncExecutor>& executor,
                      const boost::function<void()>& fn, unsigned int delayMilliseconds);
  ~RepeatDelayFunction();
  RepeatDelayFunction(const RepeatDelayFunction&) = delete;
  RepeatDelayFunction& operator=(const RepeatDelayFunction&) = delete;

  void DoNotCallAgain();

 private:
  boost::shared_ptr<boost::function<void()>> state_;
};

}  // namespace kelcore::threads
