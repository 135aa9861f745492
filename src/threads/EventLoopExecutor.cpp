#include <kelcore/threads/EventLoopExecutor.h>

#include <kelcore/threads/EventLoopAdaptor.h>
#include <kelcore/threads/PlatformEventLoop.h>
#include <kelcore/threads/SyncPoint.h>

#include <boost/make_shared.hpp>

#include <exception>
#include <thread>

namespace kelcore::threads {

AsyncEventLoopExecutor::AsyncEventLoopExecutor() = default;
AsyncEventLoopExecutor::~AsyncEventLoopExecutor() = default;

namespace {

class EventLoopExecutor final : public AsyncEventLoopExecutor {
 public:
  EventLoopExecutor(const std::string& name, ThreadPriority priority,
                    const boost::function<void()>& threadStart,
                    const boost::function<void()>& threadEnd) {
    // The thread publishes its adaptor (or the failure to make one) before the
    // handshake, which orders that write before the reads below.
    SyncPoint ready(2);
    thread_ = CreateNamedThread(name, priority, threadStart, threadEnd, [this, ready]() mutable {
      try {
        adaptor_ = AdaptCurrentEventLoopAsExecutor(true);
      } catch (...) {
        failure_ = std::current_exception();
      }
      ready.Wait();
      if (adaptor_) RunPlatformEventLoop();
    });
    ready.Wait();
    if (failure_) {
      thread_.join();
      std::rethrow_exception(failure_);
    }
  }

  ~EventLoopExecutor() override {
    adaptor_->Terminate();
    if (thread_.get_id() == std::this_thread::get_id()) {
      thread_.detach();  // released by a function running on it: it ends by itself
    } else {
      thread_.join();
    }
  }

  bool CallAsynchronously(const boost::function<void()>& fn,
                          unsigned int delayMilliseconds) override {
    return adaptor_->CallAsynchronously(fn, delayMilliseconds);
  }
  int GetThreadCount() const override { return 1; }
  void Terminate() override { adaptor_->Terminate(); }
  bool IsTerminated() const override { return adaptor_->IsTerminated(); }

 private:
  AsyncEventLoopAdaptorPtr adaptor_;
  std::exception_ptr failure_;
  std::thread thread_;
};

}  // namespace

AsyncEventLoopExecutorPtr CreateAsyncEventLoopExecutor(const std::string& name,
                                                       ThreadPriority priority,
                                                       const boost::function<void()>& threadStart,
                                                       const boost::function<void()>& threadEnd) {
  return boost::make_shared<EventLoopExecutor>(name, priority, threadStart, threadEnd);
}

}  // namespace kelcore::threads
