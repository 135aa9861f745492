#include <kelcore/threads/Gate.h>

#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/LockFreePool.h"

#include <atomic>
#include <cstdint>
#include <thread>

#if defined(_WIN32)
#include "win/ManualResetEvent.inc"
#else
#include "posix/ManualResetEvent.inc"
#endif

namespace kelcore::threads {
namespace {

// Values of a gate node's state word. The two passing states last only while their
// thread sets or resets the event; other threads wait them out, so an Open and a Close
// never interleave their event calls.
constexpr std::uint32_t kClosed = 0;
constexpr std::uint32_t kOpen = 1;
constexpr std::uint32_t kClosing = 2;  // the closing thread is resetting the event
constexpr std::uint32_t kOpening = 3;  // the opening thread is signalling the event

}  // namespace

struct Gate::Node : PoolLink, utility::SmallBlockAllocator::Allocated<Gate::Node> {
  static Node* Create() { return new Node; }
  static void Destroy(Node* node) noexcept { delete node; }

  ManualResetEvent event;
  std::atomic<std::uint32_t> state{kClosed};
};

namespace {

using GatePool = LockFreePool<Gate::Node>;

// Only the thread that moves the state from closed to opening signals the event. An
// Open that finds the gate open still writes the state (open again, with release), so
// that what its caller wrote before is published to the threads that see it open.
void OpenNode(Gate::Node& node) noexcept {
  std::uint32_t state = node.state.load(std::memory_order_acquire);
  for (;;) {
    if (state == kOpen) {
      if (node.state.compare_exchange_weak(state, kOpen, std::memory_order_acq_rel,
                                           std::memory_order_acquire)) {
        return;
      }
      continue;
    }
    if (state == kClosing || state == kOpening) {
      std::this_thread::yield();
      state = node.state.load(std::memory_order_acquire);
      continue;
    }
    if (node.state.compare_exchange_weak(state, kOpening, std::memory_order_acq_rel,
                                         std::memory_order_acquire)) {
      node.event.Set();
      node.state.store(kOpen, std::memory_order_release);
      return;
    }
  }
}

// Only the thread that moves the state from open to closing resets the event.
void CloseNode(Gate::Node& node) noexcept {
  std::uint32_t state = node.state.load(std::memory_order_acquire);
  for (;;) {
    if (state == kClosed || state == kClosing) return;
    if (state == kOpening) {
      std::this_thread::yield();
      state = node.state.load(std::memory_order_acquire);
      continue;
    }
    if (node.state.compare_exchange_weak(state, kClosing, std::memory_order_acq_rel,
                                         std::memory_order_acquire)) {
      node.event.Reset();
      node.state.store(kClosed, std::memory_order_release);
      return;
    }
  }
}

}  // namespace

Gate::Gate(bool open) : node_(GatePool::Take()) {
  // A recycled node keeps the state its last gate left it in.
  if (open) {
    OpenNode(*node_);
  } else {
    CloseNode(*node_);
  }
}

Gate::~Gate() {
  GatePool::Give(node_);
}

void Gate::Open() {
  OpenNode(*node_);
}

void Gate::Close() {
  CloseNode(*node_);
}

bool Gate::PassThrough(int milliseconds) const {
  if (node_->state.load(std::memory_order_acquire) == kOpen) return true;
  return node_->event.Wait(milliseconds);
}

}  // namespace kelcore::threads
