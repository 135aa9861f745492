// RetirementRecord: which serial numbers of a sub-executor have finished.
//
// Serial numbers start at 1 and each is retired once. With more than one function at a
// time they finish out of order, so the record keeps the highest serial up to which
// every serial has retired, plus the later ones that finished early.
#pragma once

#include <kelcore/utility/SmallBlockAllocator.h>

#include <algorithm>
#include <cstdint>
#include <functional>

namespace kelcore::threads::detail {

class RetirementRecord {
 public:
  // Every serial up to and including this one has retired.
  std::int64_t RetiredThrough() const noexcept { return through_; }

  // Makes room for `unfinished` more serials to retire ahead of an earlier one, so that
  // Retire never allocates. Throws std::bad_alloc.
  void ReserveFor(int unfinished) {
    const std::size_t needed = early_.size() + static_cast<std::size_t>(unfinished);
    if (early_.capacity() < needed) early_.reserve(std::max(needed, 2 * early_.capacity()));
  }

  // Records `serial` (never retired before); returns whether RetiredThrough advanced.
  // Never throws once ReserveFor counted the function that `serial` belongs to.
  bool Retire(std::int64_t serial) noexcept {
    if (serial != through_ + 1) {
      early_.push_back(serial);
      std::push_heap(early_.begin(), early_.end(), std::greater<>());
      return false;
    }
    ++through_;
    while (!early_.empty() && early_.front() == through_ + 1) {
      std::pop_heap(early_.begin(), early_.end(), std::greater<>());
      early_.pop_back();
      ++through_;
    }
    return true;
  }

 private:
  std::int64_t through_ = 0;
  utility::SmallBlockAllocator::vector<std::int64_t> early_;  // a min-heap
};

}  // namespace kelcore::threads::detail
