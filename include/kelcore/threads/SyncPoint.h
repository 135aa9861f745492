// SyncPoint: a reusable barrier for a fixed number of threads.
//
// Copies share one barrier; each Wait() holds its own share, so the barrier outlives the
// call even if every other copy is destroyed meanwhile. In each phase exactly one
// waiting thread (the last to arrive) gets true; the others get false. The next Wait()
// calls after a phase completes form the next phase.
//
// Memory ordering: everything each party wrote before its Wait() happens-before the
// return of every party's Wait() of the same phase.
#pragma once

#include <kelcore/Export.h>

#include <boost/shared_ptr.hpp>

namespace kelcore::threads {

class KELCORE_API SyncPoint {
 public:
  // A count of 0 throws a std::system_error whose code is 22 (invalid argument) in
  // std::generic_category() and whose what() is exactly "barrier constructor: count
  // cannot be zero.".
  explicit SyncPoint(unsigned int count);
  SyncPoint(const SyncPoint& other);
  SyncPoint& operator=(const SyncPoint& other);
  virtual ~SyncPoint();

  // Blocks until `count` threads have called Wait in this phase. True for exactly one.
  bool Wait();

  struct Barrier;

 private:
  boost::shared_ptr<Barrier> barrier_;
};

}  // namespace kelcore::threads
