#include "threads/WorkerExceptionReport.h"

#include <kelcore/debug/Assert.h>

#include <cstdlib>
#include <typeinfo>

#if defined(__GNUG__)
#include <cxxabi.h>
#endif

namespace kelcore::threads::detail {
namespace {

// The readable name of the dynamic type of `error`.
std::string TypeName(const std::type_info& type) {
#if defined(__GNUG__)
  int status = 0;
  char* demangled = abi::__cxa_demangle(type.name(), nullptr, nullptr, &status);
  if (status == 0 && demangled != nullptr) {
    std::string name(demangled);
    std::free(demangled);
    return name;
  }
  std::free(demangled);
#endif
  return type.name();
}

void Report(const WorkerReportSite& site, int line, const std::string& message) noexcept {
  debug::ReportAssertion("false", site.file, line, site.function, message.c_str());
}

}  // namespace

const WorkerReportSite kThreadedWorkQueueSite = {
    "kelcore::threads::`anonymous-namespace'::ThreadedWorkQueue::WorkerMain",
    "..\\..\\threads\\src\\ThreadedWorkQueue", 412, 419};

std::string DescribeStandardException(const std::exception& error) {
  std::string message = "WorkerMain(): caught std exception of type ";
  message += '"';
  message += TypeName(typeid(error));
  message += "\", what() returned \"";
  message += error.what();
  message += '"';
  message += ". Continuing.";
  return message;
}

std::string DescribeUnknownException() {
  return "WorkerMain(): caught unknown exception. Continuing.";
}

void RunReportingExceptions(const boost::function<void()>& fn,
                            const WorkerReportSite& site) noexcept {
  try {
    fn();
  } catch (const std::exception& error) {
    try {
      Report(site, site.standardExceptionLine, DescribeStandardException(error));
    } catch (...) {  // no memory for the message: report without it
      debug::ReportAssertion("false", site.file, site.standardExceptionLine, site.function);
    }
  } catch (...) {
    try {
      Report(site, site.unknownExceptionLine, DescribeUnknownException());
    } catch (...) {
      debug::ReportAssertion("false", site.file, site.unknownExceptionLine, site.function);
    }
  }
}

}  // namespace kelcore::threads::detail
