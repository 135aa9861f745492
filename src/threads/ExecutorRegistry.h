// The process-wide registry of current executors: the CPU-bound and I/O-bound
// executors, the main thread's event-loop adaptor, and the spare temporary executors.
//
// Everything here is read and written only with ExecutorRegistryMutex() held, and only
// for the lookup or update: never while an executor runs a function, joins a thread or
// is destroyed (copy the pointer out, release the mutex, then drop it). The mutex is
// recursive because making an executor under it may make another (an event-loop
// adaptor obtains the CPU-bound executor). The slots hold weak references: the client
// that created or set an executor owns it. The registry lives until the process ends.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/RecursiveMutex.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <vector>

namespace kelcore::threads {

class AsyncEventLoopAdaptor;

namespace detail {

RecursiveMutex& ExecutorRegistryMutex();

boost::weak_ptr<AsyncExecutor>& CPUBoundExecutorSlot();
boost::weak_ptr<AsyncExecutor>& IOBoundExecutorSlot();
// The adaptor registered for the main thread (an empty slot: none registered).
boost::weak_ptr<AsyncEventLoopAdaptor>& MainThreadAdaptorSlot();
// Paused single-threaded executors kept for borrowing (strong references, at most two).
std::vector<boost::shared_ptr<AsyncThreadedExecutor>>& SpareTemporaryExecutors();

}  // namespace detail
}  // namespace kelcore::threads
