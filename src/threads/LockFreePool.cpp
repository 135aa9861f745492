#include "threads/LockFreePool.h"

namespace kelcore::threads {
namespace {

// Nodes come from the small-block allocator and are at least 8-byte aligned, and user
// space addresses of the supported 64-bit systems are below 2^48, so an address needs
// 45 bits once its three zero bits are dropped; the other 19 bits hold the tag.
constexpr unsigned kAlignmentBits = 3;
constexpr unsigned kAddressBits = sizeof(void*) == 8 ? 45 : 32;
constexpr std::uint64_t kAddressMask = (std::uint64_t{1} << kAddressBits) - 1;

std::uint64_t Pack(PoolLink* link, std::uint64_t tag) noexcept {
  const auto address = reinterpret_cast<std::uintptr_t>(link);
  const std::uint64_t packed = static_cast<std::uint64_t>(address) >> kAlignmentBits;
  // An address outside the packable range would corrupt the pool silently.
  if ((packed & ~kAddressMask) != 0 || (address & ((1u << kAlignmentBits) - 1)) != 0) {
    std::abort();
  }
  return packed | (tag << kAddressBits);
}

PoolLink* Address(std::uint64_t head) noexcept {
  return reinterpret_cast<PoolLink*>(
      static_cast<std::uintptr_t>((head & kAddressMask) << kAlignmentBits));
}

std::uint64_t NextTag(std::uint64_t head) noexcept {
  return (head >> kAddressBits) + 1;
}

}  // namespace

void LockFreeStack::Push(PoolLink* link) noexcept {
  std::uint64_t head = head_.load(std::memory_order_relaxed);
  std::uint64_t replacement;
  do {
    link->next.store(Address(head), std::memory_order_relaxed);
    replacement = Pack(link, NextTag(head));
  } while (!head_.compare_exchange_weak(head, replacement, std::memory_order_release,
                                        std::memory_order_relaxed));
}

PoolLink* LockFreeStack::Pop() noexcept {
  std::uint64_t head = head_.load(std::memory_order_acquire);
  for (;;) {
    PoolLink* top = Address(head);
    if (top == nullptr) return nullptr;
    PoolLink* next = top->next.load(std::memory_order_relaxed);
    if (head_.compare_exchange_weak(head, Pack(next, NextTag(head)), std::memory_order_acquire,
                                    std::memory_order_acquire)) {
      return top;
    }
  }
}

}  // namespace kelcore::threads
