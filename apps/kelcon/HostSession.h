// HostSession: kelcore set up the way an application sets it up, and torn down in the
// reverse order.
//
// Construction performs the host's start-up sequence: the error manager and localizer,
// the host's identity (and preferences directory when one is given), the main thread,
// the XML parser factory, the console commands, the console log file and the trace
// handlers. Destruction undoes each step, last first, and writes the trace database.
// One session per process, made and destroyed on the thread that becomes the main
// thread.
#pragma once

#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/debug/TraceHandlerInstaller.h>
#include <kelcore/threads/MainThread.h>
#include <kelcore/utility/StringTypes.h>

#include <optional>

namespace kelcon {

struct HostOptions {
  kelcore::UTF16String prefsDir;  // empty: the library's default preferences directory
  bool openLogFile = true;
};

class HostSession {
 public:
  explicit HostSession(const HostOptions& options);
  ~HostSession();

  HostSession(const HostSession&) = delete;
  HostSession& operator=(const HostSession&) = delete;

 private:
  kelcore::config::DefaultLocalizer localizer_;
  kelcore::config::DefaultErrorManager errorManager_;
  kelcore::threads::AsyncEventLoopAdaptorPtr mainThread_;
  std::optional<kelcore::debug::TraceHandlerInstaller> traceHandlers_;
};

}  // namespace kelcon
