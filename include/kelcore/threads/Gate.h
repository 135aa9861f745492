// Gate: a door that is opened and closed by hand and that threads pass through or wait at.
//
// Open, Close and PassThrough may race with one another on one gate from any threads.
// Opening an open gate and closing a closed gate do nothing. PassThrough on an open gate
// costs one atomic operation and no system call. A gate that is being closed counts as
// not open. An Open and a Close that overlap take effect one after the other, never
// half: the gate ends in the state of the later one (an Open that meets a Close in
// progress waits for it and then opens).
//
// Memory ordering: everything a thread wrote before Open() happens-before the return of a
// PassThrough() that sees the gate open (or is woken by that Open).
//
// Gates are cheap to make and destroy: the event behind a gate comes from a process-wide
// lock-free pool and goes back to it on destruction (the pool is emptied at exit). The
// constructor throws std::bad_alloc when the pool is empty and no new event can be made.
// Destroying a gate while another thread still uses it is a caller error.
#pragma once

#include <kelcore/Export.h>

namespace kelcore::threads {

class KELCORE_API Gate {
 public:
  // Starts open or closed, whatever state the pooled event was left in.
  explicit Gate(bool open);
  ~Gate();
  Gate(const Gate&) = delete;
  Gate& operator=(const Gate&) = delete;

  void Open();
  void Close();

  // Returns true when the gate is open or opens within `milliseconds`; false on
  // time-out. A negative time waits without limit; 0 tests without waiting.
  bool PassThrough(int milliseconds) const;

  struct Node;

 private:
  Node* node_;
};

}  // namespace kelcore::threads
