// Storage for the small-block allocator's process-wide state: constant-initialized and
// never destroyed, so that the allocator serves static constructors and destructors of
// any other code, in any order.
#pragma once

namespace kelcore::utility::smallblock {

template <class T>
union Global {
  constexpr Global() : value() {}
  ~Global() {}  // deliberately leaves `value` alive

  T* operator->() noexcept { return &value; }
  T& operator*() noexcept { return value; }

  T value;
};

}  // namespace kelcore::utility::smallblock
