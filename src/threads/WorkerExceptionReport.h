// Running a queued function on a worker thread so that an exception escaping it is
// reported through the assert facility and swallowed: the worker lives on.
//
// The report's expression is "false"; its message is
//   WorkerMain(): caught std exception of type "<type name>", what() returned "<what>". Continuing.
// for a standard exception (the type name as the compiler's runtime spells it, e.g.
// std::runtime_error) and
//   WorkerMain(): caught unknown exception. Continuing.
// for anything else. The site says which function, file and lines the report names.
#pragma once

#include <boost/function.hpp>

#include <exception>
#include <string>

namespace kelcore::threads::detail {

struct WorkerReportSite {
  const char* function;
  const char* file;
  int standardExceptionLine;
  int unknownExceptionLine;
};

// The site of the threaded work queues' workers.
extern const WorkerReportSite kThreadedWorkQueueSite;

std::string DescribeStandardException(const std::exception& error);
std::string DescribeUnknownException();

void RunReportingExceptions(const boost::function<void()>& fn,
                            const WorkerReportSite& site) noexcept;

}  // namespace kelcore::threads::detail
