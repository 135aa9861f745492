// AsyncTraceHandler: moves trace output off the tracing thread.
//
// Each message is copied and handed to a sub-executor of concurrency 1 over the I/O-bound
// executor (threads::CreateSubExecutor(threads::CreateIOBoundExecutor(), 1)), which
// passes it on to the next handler. Messages therefore reach the next handler one at a
// time, in the order of the HandleTrace calls that returned (so each thread's messages
// keep their order), and the tracing thread never waits for the output. When the
// executor cannot be had or no longer accepts work, messages are passed on at once on
// the calling thread instead, so none is lost. Exceptions thrown by the next handler on
// the executor's thread are swallowed: there is no caller left to receive them.
//
// The handler keeps the sub-executor (and through it the I/O-bound executor) alive.
// Destruction first waits until every message handed over has been passed on, then
// shuts the sub-executor down; the next handler must outlive this one.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/TraceHandler.h>

#include <boost/shared_ptr.hpp>

namespace kelcore::threads {
class AsyncThreadedExecutor;
}

namespace kelcore::debug {

class KELCORE_API AsyncTraceHandler : public TraceHandler {
 public:
  // Wraps the handler that is master now.
  AsyncTraceHandler();
  explicit AsyncTraceHandler(TraceHandler& next);
  ~AsyncTraceHandler() override;
  AsyncTraceHandler(const AsyncTraceHandler&) = delete;
  AsyncTraceHandler& operator=(const AsyncTraceHandler&) = delete;

  void HandleTrace(const UTF8String& message) override;
  // Returns once every message handed over before the call has been passed on. Must not
  // be called from the next handler (it returns at once there).
  void Flush();
  TraceHandler& Next() const { return *next_; }

 private:
  TraceHandler* next_;
  boost::shared_ptr<threads::AsyncThreadedExecutor> executor_;
};

}  // namespace kelcore::debug
