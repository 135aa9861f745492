// Running a client's function where no caller can receive its exception (a thread's
// body, a message of an event loop): an escaping exception is reported through the
// assert facility and swallowed, so the thread or loop goes on.
#pragma once

#include <boost/function.hpp>

namespace kelcore::threads {

// Calls `fn` unless it is empty. `where` names the calling function in the report and
// `context` (may be empty) is added to the message.
void CallReportingExceptions(const boost::function<void()>& fn, const char* where,
                             const char* context = "") noexcept;

}  // namespace kelcore::threads
