// Threads that carry a name for debuggers and system tools, their priorities, and the
// machine's processor count.
#pragma once

#include <kelcore/Export.h>

#include <boost/function.hpp>

#include <string>
#include <thread>

namespace kelcore::threads {

// Thread priorities, mapped best effort onto the operating system's: on Windows onto
// SetThreadPriority's levels of the same names; on Linux onto the thread's nice value,
// relative to the process's (Idle +19, Lowest +10, BelowNormal +5, Normal unchanged,
// AboveNormal -5, Highest -10, TimeCritical -20, kept within -20..19). Raising a
// thread above the process needs privileges; without them it keeps the process's value.
enum ThreadPriority {
  kThreadPriorityIdle = 0,
  kThreadPriorityLowest = 1,
  kThreadPriorityBelowNormal = 2,
  kThreadPriorityNormal = 3,
  kThreadPriorityAboveNormal = 4,
  kThreadPriorityHighest = 5,
  kThreadPriorityTimeCritical = 6,
};

// The number of logical processors of the machine, at least 1.
KELCORE_API int CPUCount();

// Starts a thread named `name` (visible in debuggers and `top -H`; on Linux cut to 15
// bytes, never inside a UTF-8 character) at `priority` that runs `threadStart`, `body`,
// then `threadEnd`; empty functions are skipped. An exception escaping one of them is
// reported through the assert facility (kelcore/debug/Assert.h) and swallowed, and the
// later ones still run. The caller joins the returned thread. Throws std::system_error
// when the thread cannot be started.
KELCORE_API std::thread CreateNamedThread(const std::string& name, ThreadPriority priority,
                                          const boost::function<void()>& threadStart,
                                          const boost::function<void()>& threadEnd,
                                          const boost::function<void()>& body);

}  // namespace kelcore::threads
