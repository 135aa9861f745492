// The blocks that carry a function through an executor's queues: a copy of the
// caller's function, allocated from the small-block allocator so that posting costs no
// trip to the general heap.
#pragma once

#include <kelcore/utility/SmallBlockAllocator.h>

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

// A function queued on a worker set or a threaded work queue.
struct AllocatedFunction : utility::SmallBlockAllocator::Allocated<AllocatedFunction> {
  explicit AllocatedFunction(const boost::function<void()>& function) : fn(function) {}

  boost::function<void()> fn;
};

// A function of a thread pool executor. Delayed calls also carry a share of their
// executor's cancellation flag (0 while the executor lives, 1 once it is destroyed),
// which outlives the executor for as long as the call is pending.
struct PoolFunction : utility::SmallBlockAllocator::Allocated<PoolFunction> {
  PoolFunction(const boost::function<void()>& function, bool longFunction)
      : fn(function), isLong(longFunction) {}

  bool Cancelled() const noexcept {
    return cancelled && cancelled->load(std::memory_order_acquire) != 0;
  }

  boost::function<void()> fn;
  boost::shared_ptr<std::atomic<int>> cancelled;  // empty for calls without delay
  bool isLong;                                    // runs on the I/O worker set
};

// A function of a sub-executor with the serial number that orders it.
struct AllocatedFunctionWithSerialNumber
    : utility::SmallBlockAllocator::Allocated<AllocatedFunctionWithSerialNumber> {
  AllocatedFunctionWithSerialNumber(const boost::function<void()>& function, std::int64_t serial)
      : fn(function), serialNumber(serial) {}

  boost::function<void()> fn;
  std::int64_t serialNumber;
  AllocatedFunctionWithSerialNumber* link = nullptr;  // the ready container's chain
};

}  // namespace kelcore::threads::detail
