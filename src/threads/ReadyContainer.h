// ReadyContainer: a sub-executor's functions that wait for a free slot, chained through
// their own link field. The queue-based kind takes the oldest first (FIFO), the
// stack-based kind the newest (LIFO). Not thread-safe: the sub-executor's mutex guards
// it. The container owns the functions it holds.
#pragma once

#include "threads/FunctionItems.h"

#include <cstdint>

namespace kelcore::threads::detail {

enum class ReadyOrder { kOldestFirst, kNewestFirst };

class ReadyContainer {
 public:
  using Item = AllocatedFunctionWithSerialNumber;

  explicit ReadyContainer(ReadyOrder order) : order_(order) {}
  ~ReadyContainer() { DestroyChain(TakeAll()); }
  ReadyContainer(const ReadyContainer&) = delete;
  ReadyContainer& operator=(const ReadyContainer&) = delete;

  bool Empty() const noexcept { return first_ == nullptr; }
  std::int64_t Size() const noexcept { return size_; }

  void Put(Item* item) noexcept {
    item->link = nullptr;
    if (first_ == nullptr) {
      first_ = last_ = item;
    } else if (order_ == ReadyOrder::kOldestFirst) {
      last_->link = item;
      last_ = item;
    } else {
      item->link = first_;
      first_ = item;
    }
    ++size_;
  }

  // The next function to start; the container must not be empty.
  Item* Take() noexcept {
    Item* item = first_;
    first_ = item->link;
    if (first_ == nullptr) last_ = nullptr;
    item->link = nullptr;
    --size_;
    return item;
  }

  // Takes up to `count` (>= 1) functions, in the order Take would give them, as a
  // chain; the container must not be empty.
  Item* TakeUpTo(std::int64_t count) noexcept {
    Item* chain = first_;
    Item* end = first_;
    for (std::int64_t i = 1; i < count && end->link != nullptr; ++i) end = end->link;
    first_ = end->link;
    if (first_ == nullptr) last_ = nullptr;
    end->link = nullptr;
    for (Item* item = chain; item != nullptr; item = item->link) --size_;
    return chain;
  }

  // Puts a chain taken by TakeUpTo back where it came from, so that it is taken next.
  void PutBack(Item* chain) noexcept {
    if (chain == nullptr) return;
    Item* end = chain;
    ++size_;
    while (end->link != nullptr) {
      end = end->link;
      ++size_;
    }
    end->link = first_;
    if (first_ == nullptr) last_ = end;
    first_ = chain;
  }

  // Takes back the function put last; the container must not be empty.
  Item* TakeNewest() noexcept {
    if (order_ == ReadyOrder::kNewestFirst || first_ == last_) return Take();
    Item* before = first_;
    while (before->link != last_) before = before->link;
    Item* item = last_;
    before->link = nullptr;
    last_ = before;
    --size_;
    return item;
  }

  // Empties the container; the caller owns the returned chain.
  Item* TakeAll() noexcept {
    Item* chain = first_;
    first_ = last_ = nullptr;
    size_ = 0;
    return chain;
  }

  static void DestroyChain(Item* chain) noexcept {
    while (chain != nullptr) {
      Item* next = chain->link;
      delete chain;
      chain = next;
    }
  }

 private:
  const ReadyOrder order_;
  Item* first_ = nullptr;
  Item* last_ = nullptr;
  std::int64_t size_ = 0;
};

}  // namespace kelcore::threads::detail
