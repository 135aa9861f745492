// Process-wide recycling pools for the nodes behind Gate, RecursiveMutex and
// ConditionVariable, so that those objects are cheap to create and destroy.
//
// A pool is an ABA-safe lock-free stack of nodes. The head is one 64-bit word holding
// the top node's address and a tag that changes on every push and pop, so a pop that
// raced with a pop and a re-push of the same node fails its compare-and-swap instead of
// installing a stale link. Nodes are never freed while the process runs (only when the
// pool is emptied at exit), so a pop may read the link of a node that another thread has
// just taken; the link is atomic for that reason.
#pragma once

#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <mutex>

namespace kelcore::threads {

// The first part of every pooled node.
struct PoolLink {
  std::atomic<PoolLink*> next{nullptr};
};

class LockFreeStack {
 public:
  constexpr LockFreeStack() = default;

  // Release: whatever the pusher wrote to the node is visible to the thread that pops it.
  void Push(PoolLink* link) noexcept;
  // Null when empty.
  PoolLink* Pop() noexcept;

 private:
  std::atomic<std::uint64_t> head_{0};
};

// The pool of one node type. Node derives from PoolLink and provides
//   static Node* Create();          // a fresh node; throws std::bad_alloc on failure
//   static void Destroy(Node*) noexcept;
// The pool registers, on its first use by any thread, an at-exit routine that destroys
// every node it then holds. Nodes in use at exit belong to live objects and are not
// destroyed; if they are given back after the emptying they simply stay in the pool.
template <class Node>
class LockFreePool {
 public:
  static Node* Take() {
    std::call_once(initialized_, [] { std::atexit(&EmptyAtExit); });
    if (PoolLink* link = stack_.Pop()) return static_cast<Node*>(link);
    return Node::Create();
  }

  static void Give(Node* node) noexcept {
    if (node != nullptr) stack_.Push(node);
  }

 private:
  static void EmptyAtExit() {
    while (PoolLink* link = stack_.Pop()) Node::Destroy(static_cast<Node*>(link));
  }

  // Trivially destructible: still usable by objects destroyed after the emptying.
  static constinit inline LockFreeStack stack_{};
  static constinit inline std::once_flag initialized_{};
};

}  // namespace kelcore::threads
