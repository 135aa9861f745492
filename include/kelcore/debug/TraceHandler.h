// TraceHandler: where traced text goes, and the process-wide master handler that
// Trace() hands every message to.
//
// Clients derive from TraceHandler to capture or redirect trace output. The master
// handler is a plain pointer that the trace system does not own: whoever installs a
// handler keeps it alive until it is removed (or replaced). With none installed, the
// built-in DefaultTraceHandler is the master.
//
// Threads: HandleTrace may be called from any number of threads at once; handlers must
// be thread-safe. The master pointer is read without a lock by Trace() (an acquire load,
// so a handler installed before a thread traces is seen fully constructed), which means
// installing, removing or destroying handlers while other threads trace is the client's
// business: install at start-up, remove after tracing has stopped.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::debug {

class KELCORE_API TraceHandler {
 public:
  // Handles one message. Exceptions escape to the caller of Trace().
  virtual void HandleTrace(const UTF8String& message) = 0;
  virtual ~TraceHandler();
};

// Makes `handler` the master; null is the same as RemoveMasterTraceHandler().
KELCORE_API void InstallMasterTraceHandler(TraceHandler* handler);
// Returns to the default handler. The previous handler is not restored.
KELCORE_API void RemoveMasterTraceHandler();
// The installed master, or the default handler when none is installed; never null.
KELCORE_API TraceHandler* GetMasterTraceHandler();

}  // namespace kelcore::debug
