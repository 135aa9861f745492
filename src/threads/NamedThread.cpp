#include <kelcore/threads/NamedThread.h>

#include "threads/ReportingCall.h"

#include <string>

// The platform part names the calling thread and sets its priority, best effort:
// failures leave it unnamed or at the priority it inherited.
#if defined(_WIN32)
#include "win/NamedThread.inc"
#else
#include "posix/NamedThread.inc"
#endif

namespace kelcore::threads {
namespace {

constexpr const char* kWhere = "kelcore::threads::CreateNamedThread";

}  // namespace

int CPUCount() {
  const unsigned int count = std::thread::hardware_concurrency();
  return count == 0 ? 1 : static_cast<int>(count);
}

std::thread CreateNamedThread(const std::string& name, ThreadPriority priority,
                              const boost::function<void()>& threadStart,
                              const boost::function<void()>& threadEnd,
                              const boost::function<void()>& body) {
  return std::thread([name, priority, threadStart, threadEnd, body] {
    NameCurrentThread(name);
    if (priority != kThreadPriorityNormal) SetCurrentThreadPriority(priority);
    // An exception escaping one part is reported; the later parts still run.
    const std::string context = "thread \"" + name + "\"";
    CallReportingExceptions(threadStart, kWhere, context.c_str());
    CallReportingExceptions(body, kWhere, context.c_str());
    CallReportingExceptions(threadEnd, kWhere, context.c_str());
  });
}

}  // namespace kelcore::threads
