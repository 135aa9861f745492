// TraceHandlerInstaller: sets up the trace handler chain from the developer switches in
// the debug database, and takes it down again.
//
// The constructor reads these entries of DebugDatabase::Instance() (a boolean entry is
// on when its value is "true"; absent entries count as off, 0 for the number, and are
// not created):
//   1. "AddTimestampToLogFileNames": the console log file names its logs with
//      ConsoleLogFile::GetTimestampedLogFileName.
//   2. "MaxLogSize" (bytes, decimal), "CreateLogFilesThatDoNotExist" and
//      "RolloverLogsDaily": when MaxLogSize > 0 or RolloverLogsDaily is on, a
//      RollingTraceHandler is made around the current master and installed as master.
//   3. "AddUTCTimestampToTraces": a TimestampTraceHandler around the current master is
//      installed.
//   4. "TraceAsync": an AsyncTraceHandler around the current master is installed.
// Seen from the tracing code the chain is then: asynchronous, time stamp, rolling, then
// the handler that was master before.
//
// Copies share the handlers and the installation: when the last copy is destroyed (or
// assigned another installation) it calls RemoveMasterTraceHandler() if anything was
// installed, then releases the handlers, the asynchronous one first so that its pending
// messages still find the rest of the chain. Removing returns to the default handler; it
// does not restore a handler the client had installed before.
//
// Threads: make and destroy installers at start-up and shut-down, while no other thread
// traces (installing handlers is not synchronised with Trace()).
#pragma once

#include <kelcore/Export.h>

#include <memory>

namespace kelcore::debug {

class KELCORE_API TraceHandlerInstaller {
 public:
  TraceHandlerInstaller();
  TraceHandlerInstaller(const TraceHandlerInstaller& other);
  TraceHandlerInstaller& operator=(const TraceHandlerInstaller& other);
  ~TraceHandlerInstaller();

  // Whether this installation installed any handler.
  bool InstalledAny() const;

 private:
  struct Installation;
  std::shared_ptr<Installation> installation_;
};

}  // namespace kelcore::debug
