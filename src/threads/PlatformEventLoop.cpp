#include <kelcore/threads/PlatformEventLoop.h>

#include "threads/MessageQueue.h"
#include "threads/ReportingCall.h"

#include <cstddef>

namespace kelcore::threads {
namespace {

constexpr const char* kWhere = "kelcore::threads::RunPlatformEventLoop";

}  // namespace

void RunPlatformEventLoop() {
  const std::shared_ptr<MessageQueue> queue = MessageQueue::ForCurrentThread();
  MessageQueue::Function fn;
  while (queue->Take(fn, true) == MessageQueue::Taken::kFunction) {
    CallReportingExceptions(fn, kWhere, "message");
    fn.clear();
  }
}

PlatformEventLoopHandle GetPlatformEventLoopHandle() {
  return MessageQueue::ForCurrentThread()->Handle();
}

bool DispatchPlatformEventLoopMessages() {
  const std::shared_ptr<MessageQueue> queue = MessageQueue::ForCurrentThread();
  MessageQueue::Function fn;
  for (std::size_t left = queue->Count(); left > 0; --left) {
    switch (queue->Take(fn, false)) {
      case MessageQueue::Taken::kNothing:
        return true;
      case MessageQueue::Taken::kQuit:
        return false;
      case MessageQueue::Taken::kFunction:
        CallReportingExceptions(fn, kWhere, "message");
        fn.clear();
        break;
    }
  }
  return true;
}

}  // namespace kelcore::threads
