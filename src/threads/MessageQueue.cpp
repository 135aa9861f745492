#include "threads/MessageQueue.h"

#include <kelcore/utility/SmallBlockAllocator.h>

#if defined(_WIN32)
#include "win/QueueSignal.inc"
#else
#include "posix/QueueSignal.inc"
#endif

namespace kelcore::threads {

struct MessageQueue::Message : utility::SmallBlockAllocator::Allocated<MessageQueue::Message> {
  Message* next = nullptr;
  Function fn;  // empty for a quit request
};

namespace {

// Owns the thread's reference to its queue and closes the queue when the thread ends.
struct ThreadQueueHolder {
  ~ThreadQueueHolder() {
    if (queue) queue->Close();
  }
  std::shared_ptr<MessageQueue> queue;
};

thread_local ThreadQueueHolder threadQueue;

}  // namespace

std::shared_ptr<MessageQueue> MessageQueue::ForCurrentThread() {
  if (!threadQueue.queue) threadQueue.queue = std::make_shared<MessageQueue>();
  return threadQueue.queue;
}

MessageQueue::MessageQueue() : signal_(std::make_unique<Signal>()) {}

MessageQueue::~MessageQueue() {
  Close();
}

bool MessageQueue::Post(const Function& fn) {
  auto* message = new Message;
  message->fn = fn;
  return Append(posted_, message);
}

bool MessageQueue::SendNotify(const Function& fn) {
  auto* message = new Message;
  message->fn = fn;
  return Append(sent_, message);
}

bool MessageQueue::PostQuit() {
  return Append(posted_, new Message);
}

bool MessageQueue::Append(Fifo& fifo, Message* message) {
  {
    std::lock_guard<std::mutex> lock(mutex_);
    if (!closed_) {
      if (fifo.last != nullptr) {
        fifo.last->next = message;
      } else {
        fifo.first = message;
      }
      fifo.last = message;
      if (count_++ == 0) signal_->Raise();
      return true;
    }
  }
  delete message;  // outside the lock: the function's destructor may do anything
  return false;
}

MessageQueue::Taken MessageQueue::Take(Function& fn, bool wait) {
  Message* message = nullptr;
  for (;;) {
    {
      std::lock_guard<std::mutex> lock(mutex_);
      Fifo& fifo = sent_.first != nullptr ? sent_ : posted_;
      message = fifo.first;
      if (message != nullptr) {
        fifo.first = message->next;
        if (fifo.first == nullptr) fifo.last = nullptr;
        if (--count_ == 0) signal_->Clear();
        break;
      }
    }
    if (!wait) return Taken::kNothing;
    signal_->Wait();
  }
  const bool quit = message->fn.empty();
  fn.swap(message->fn);
  delete message;
  return quit ? Taken::kQuit : Taken::kFunction;
}

std::size_t MessageQueue::Count() const {
  std::lock_guard<std::mutex> lock(mutex_);
  return count_;
}

PlatformEventLoopHandle MessageQueue::Handle() const {
  return signal_->Handle();
}

void MessageQueue::Close() noexcept {
  Message* sent = nullptr;
  Message* posted = nullptr;
  {
    std::lock_guard<std::mutex> lock(mutex_);
    closed_ = true;
    sent = sent_.first;
    posted = posted_.first;
    sent_ = Fifo();
    posted_ = Fifo();
    if (count_ != 0) signal_->Clear();
    count_ = 0;
  }
  DestroyAll(sent);
  DestroyAll(posted);
}

void MessageQueue::DestroyAll(Message* message) noexcept {
  while (message != nullptr) {
    Message* next = message->next;
    delete message;
    message = next;
  }
}

}  // namespace kelcore::threads
