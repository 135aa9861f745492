#include "threads/SubExecutor.h"

#include <kelcore/threads/Executors.h>

#include <boost/make_shared.hpp>

#include <algorithm>
#include <climits>
#include <cstdint>

namespace kelcore::threads {
namespace detail {

SubExecutor::~SubExecutor() {
  impl_->Abandon();
}

bool SubExecutor::CallAsynchronously(const boost::function<void()>& fn,
                                     unsigned int delayMilliseconds) {
  return impl_->CallAsynchronously(fn, delayMilliseconds);
}

int SubExecutor::GetThreadCount() const {
  return impl_->GetThreadCount();
}

void SubExecutor::Terminate() {
  impl_->Terminate();
}

bool SubExecutor::IsTerminated() const {
  return impl_->IsTerminated();
}

bool SubExecutor::IsCurrentThreadExecutorThread() const {
  return impl_->IsCurrentThreadExecutorThread();
}

void SubExecutor::Flush() {
  impl_->Flush();
}

void SubExecutor::Pause() {
  impl_->Pause();
}

void SubExecutor::Resume() {
  impl_->Resume();
}

int EffectiveConcurrency(int parentThreads, int maxConcurrent) noexcept {
  const std::int64_t threads = std::max(parentThreads, 0);
  const std::int64_t effective = maxConcurrent >= 0
                                     ? std::min<std::int64_t>(maxConcurrent, threads)
                                     : threads * -static_cast<std::int64_t>(maxConcurrent);
  return static_cast<int>(std::min<std::int64_t>(effective, INT_MAX));
}

namespace {

template <class Impl, class... Extra>
AsyncThreadedExecutorPtr MakeSubExecutor(const AsyncExecutorPtr& parent, int maxConcurrent,
                                         const Extra&... extra) {
  const int effective = EffectiveConcurrency(parent ? parent->GetThreadCount() : 0, maxConcurrent);
  if (effective <= 0) return AsyncThreadedExecutorPtr();
  return boost::make_shared<SubExecutor>(boost::make_shared<Impl>(parent, effective, extra...));
}

}  // namespace
}  // namespace detail

AsyncThreadedExecutorPtr CreateQueueBasedSubExecutor(const AsyncExecutorPtr& parent,
                                                     int maxConcurrent) {
  return detail::MakeSubExecutor<detail::SubExecutorImpl>(parent, maxConcurrent,
                                                          detail::ReadyOrder::kOldestFirst);
}

AsyncThreadedExecutorPtr CreateSubExecutor(const AsyncExecutorPtr& parent, int maxConcurrent) {
  return CreateQueueBasedSubExecutor(parent, maxConcurrent);
}

AsyncExecutorPtr CreateStackBasedSubExecutor(const AsyncExecutorPtr& parent, int maxConcurrent) {
  return detail::MakeSubExecutor<detail::SubExecutorImpl>(parent, maxConcurrent,
                                                          detail::ReadyOrder::kNewestFirst);
}

AsyncThreadedExecutorPtr CreateSubExecutorWithFunctionWrapper(
    const AsyncExecutorPtr& parent, int maxConcurrent,
    const boost::function<void(const boost::function<void()>&)>& wrapper) {
  if (wrapper.empty()) return CreateQueueBasedSubExecutor(parent, maxConcurrent);
  return detail::MakeSubExecutor<detail::SubExecutorWithFnWrapperImpl>(parent, maxConcurrent,
                                                                       wrapper);
}

}  // namespace kelcore::threads
