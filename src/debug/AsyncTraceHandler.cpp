#include <kelcore/debug/AsyncTraceHandler.h>

#include <kelcore/threads/Executors.h>

namespace kelcore::debug {

namespace {

// Runs on the executor's thread, where nobody could receive an exception.
void PassOn(TraceHandler* next, const UTF8String& message) noexcept {
  try {
    next->HandleTrace(message);
  } catch (...) {
  }
}

}  // namespace

AsyncTraceHandler::AsyncTraceHandler() : AsyncTraceHandler(*GetMasterTraceHandler()) {}

AsyncTraceHandler::AsyncTraceHandler(TraceHandler& next)
    : next_(&next), executor_(threads::CreateSubExecutor(threads::CreateIOBoundExecutor(), 1)) {}

AsyncTraceHandler::~AsyncTraceHandler() {
  if (!executor_) return;
  executor_->Flush();
  executor_->Terminate();
}

void AsyncTraceHandler::HandleTrace(const UTF8String& message) {
  TraceHandler* const next = next_;
  if (executor_ && executor_->CallAsynchronously([next, message] { PassOn(next, message); }, 0)) {
    return;
  }
  next_->HandleTrace(message);
}

void AsyncTraceHandler::Flush() {
  if (executor_) executor_->Flush();
}

}  // namespace kelcore::debug
