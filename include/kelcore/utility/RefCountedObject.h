// Base class of objects shared through boost::intrusive_ptr.
//
// The count lives inside the object and starts at 0; boost::intrusive_ptr finds
// intrusive_ptr_add_ref and intrusive_ptr_release by argument-dependent lookup. The
// count changes atomically, so pointers to one object may be copied and released on
// any threads at once: adding a reference is relaxed, the last release is an
// acquire-release step so that every write made through other references is visible
// to the destructor. When the count drops to 0 the object is deleted through its
// virtual destructor, so an object held by intrusive_ptr must have been made with new
// (or by a factory that says so); one that lives on the stack or inside another object
// must never be handed to an intrusive_ptr.
//
// Copying an object gives the copy a fresh count of 0: references belong to the
// object, not to its value.
#pragma once

#include <kelcore/Export.h>

#include <atomic>

namespace kelcore::utility {

class KELCORE_API RefCountedObject {
 public:
  RefCountedObject() noexcept = default;
  RefCountedObject(const RefCountedObject&) noexcept {}
  RefCountedObject& operator=(const RefCountedObject&) noexcept { return *this; }

  // The number of intrusive_ptr references; a snapshot when other threads hold some.
  unsigned int GetRefCount() const noexcept { return count_.load(std::memory_order_relaxed); }

  friend void intrusive_ptr_add_ref(const RefCountedObject* object) noexcept {
    object->count_.fetch_add(1, std::memory_order_relaxed);
  }
  friend void intrusive_ptr_release(const RefCountedObject* object) noexcept {
    if (object->count_.fetch_sub(1, std::memory_order_acq_rel) == 1) delete object;
  }

 protected:
  virtual ~RefCountedObject();

 private:
  mutable std::atomic<unsigned int> count_{0};
};

}  // namespace kelcore::utility
