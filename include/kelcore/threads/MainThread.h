// The application's main thread: registered once, then reachable from every thread.
//
// The registration is held weakly, in the process-wide registry of current executors
// and under its mutex: the application owns the adaptor that registration returns, and
// when it releases the last reference the registration lapses (calls are then dropped,
// and registering again makes a new adaptor). All functions may be called from any
// thread; none runs a client function with the registry mutex held.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/EventLoopAdaptor.h>

#include <boost/function.hpp>

namespace kelcore::threads {

// Registers the calling thread as the main thread and returns its adaptor
// (AdaptCurrentEventLoopAsExecutor(true)); the thread must pump its event loop for
// posted functions to run. Called again on the registered thread while the adaptor
// lives, it returns the same adaptor. Called on another thread while a registration is
// alive, it is an input contract violation: it is reported through the assert facility
// and then raised through kelcore::config::ThrowError (fatal, component 105, error 25,
// deferral allowed, "$$$/kelcore/utility/Error/Contract/InputContractViolation=An input
// contract violation has occurred!"); if the error manager defers instead of throwing,
// the result is empty. Throws std::system_error when the thread's queue cannot be made.
KELCORE_API AsyncEventLoopAdaptorPtr RegisterCurrentThreadAsMainThread();

// The registered adaptor, or empty when none is registered or it has been released.
KELCORE_API AsyncEventLoopAdaptorPtr GetRegisteredMainThread();

// True on the registered main thread; false on any other thread and whenever no
// registration is alive.
KELCORE_API bool CurrentThreadIsMainThread();

// Hands `fn` to the main thread (CallAsynchronously(fn, 0) on its adaptor). Without a
// live registration the function is dropped silently, as it is when the adaptor
// refuses it.
KELCORE_API void AsyncCallFromMainThread(const boost::function<void()>& fn);

}  // namespace kelcore::threads
