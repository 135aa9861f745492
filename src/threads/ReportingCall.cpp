#include "threads/ReportingCall.h"

#include <kelcore/debug/Assert.h>

#include <exception>
#include <string>
#include <typeinfo>

namespace kelcore::threads {
namespace {

void Report(const char* where, const char* context, const char* description) noexcept {
  try {
    std::string message = context;
    if (!message.empty()) message += ": ";
    message += description;
    message += ". Continuing.";
    debug::ReportAssertion("false", __FILE__, __LINE__, where, message.c_str());
  } catch (...) {
    debug::ReportAssertion("false", __FILE__, __LINE__, where, description);
  }
}

}  // namespace

void CallReportingExceptions(const boost::function<void()>& fn, const char* where,
                             const char* context) noexcept {
  if (fn.empty()) return;
  try {
    fn();
  } catch (const std::exception& error) {
    try {
      const std::string description = std::string("caught std exception of type \"") +
                                      typeid(error).name() + "\", what() returned \"" +
                                      error.what() + "\"";
      Report(where, context, description.c_str());
    } catch (...) {
      Report(where, context, "caught std exception");
    }
  } catch (...) {
    Report(where, context, "caught unknown exception");
  }
}

}  // namespace kelcore::threads
