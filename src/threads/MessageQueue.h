// MessageQueue: the library's own per-thread message queue behind the platform event
// loop (kelcore/threads/PlatformEventLoop.h).
//
// Two FIFOs of messages: sent messages (from other threads) are taken before posted
// ones. A message is a function or a quit request; both live in blocks of the
// small-block allocator. A signal (an eventfd on Linux) is raised exactly while the
// queue holds messages. Producers may be any threads; only the owning thread takes.
// The state is under one mutex that is never held while a function runs or is
// destroyed.
#pragma once

#include <kelcore/threads/PlatformEventLoop.h>

#include <boost/function.hpp>

#include <cstddef>
#include <memory>
#include <mutex>

namespace kelcore::threads {

class MessageQueue {
 public:
  using Function = boost::function<void()>;

  // The calling thread's queue, made on its first use. The thread's own reference goes
  // when the thread ends, which closes the queue. Throws std::system_error when the
  // signal cannot be made and std::bad_alloc when memory runs out.
  static std::shared_ptr<MessageQueue> ForCurrentThread();

  MessageQueue();
  ~MessageQueue();
  MessageQueue(const MessageQueue&) = delete;
  MessageQueue& operator=(const MessageQueue&) = delete;

  // Append a message behind the posted ones / the sent ones, or a quit request behind
  // the posted ones. False, with nothing queued, once the queue is closed. Throw
  // std::bad_alloc when no block can be had.
  bool Post(const Function& fn);
  bool SendNotify(const Function& fn);
  bool PostQuit();

  enum class Taken { kNothing, kFunction, kQuit };
  // Owning thread only. Takes the next message: a function is swapped into `fn`. With
  // `wait`, sleeps while the queue is empty (never returns kNothing then).
  Taken Take(Function& fn, bool wait);
  // The number of queued messages.
  std::size_t Count() const;
  PlatformEventLoopHandle Handle() const;

  // Refuses later messages and destroys the queued ones.
  void Close() noexcept;

 private:
  struct Message;
  class Signal;

  struct Fifo {
    Message* first = nullptr;
    Message* last = nullptr;
  };

  bool Append(Fifo& fifo, Message* message);
  static void DestroyAll(Message* message) noexcept;

  mutable std::mutex mutex_;
  Fifo sent_;
  Fifo posted_;
  std::size_t count_ = 0;
  bool closed_ = false;
  std::unique_ptr<Signal> signal_;
};

}  // namespace kelcore::threads
