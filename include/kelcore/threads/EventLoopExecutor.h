// AsyncEventLoopExecutor: a thread of its own that runs an event loop, as an executor.
//
// The executor forwards to the AsyncEventLoopAdaptor of its thread (see
// kelcore/threads/EventLoopAdaptor.h for the order and delay rules); GetThreadCount()
// is 1. Terminate() stops accepting work and ends the thread's loop; functions queued
// before it still run if the loop reaches them first. Destroying the executor
// terminates it and waits for its thread to end (unless the last reference goes on that
// thread itself, which then ends on its own). All operations may be called from any
// thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/NamedThread.h>

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <string>

namespace kelcore::threads {

class KELCORE_API AsyncEventLoopExecutor : public AsyncExecutor {
 public:
  AsyncEventLoopExecutor();
  ~AsyncEventLoopExecutor() override;
};

using AsyncEventLoopExecutorPtr = boost::shared_ptr<AsyncEventLoopExecutor>;

// Starts a thread with CreateNamedThread(name, priority, threadStart, threadEnd, ...)
// that adapts its event loop and runs it until terminated; returns once the thread is
// ready to run functions (after `threadStart` has returned). Throws std::system_error
// when the thread or its queue cannot be made.
KELCORE_API AsyncEventLoopExecutorPtr CreateAsyncEventLoopExecutor(
    const std::string& name, ThreadPriority priority, const boost::function<void()>& threadStart,
    const boost::function<void()>& threadEnd);

}  // namespace kelcore::threads
