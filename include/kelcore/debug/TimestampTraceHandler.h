// TimestampTraceHandler: prefixes each message with the UTC time and passes it on.
//
// The prefix is the time in ISO 8601 form with microseconds and a final "Z", then one
// space: "2026-11-22T07:58:10.123456Z " + message. Messages are otherwise unchanged
// (a message of several lines gets one prefix). A clock that gives no valid time (a
// special ptime) adds no prefix.
//
// Threads: HandleTrace may run on any number of threads at once (the clock must allow
// it; the default one does). The next handler must outlive this one.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/TraceHandler.h>

#include <boost/date_time/posix_time/ptime.hpp>
#include <boost/function.hpp>

namespace kelcore::debug {

class KELCORE_API TimestampTraceHandler : public TraceHandler {
 public:
  // Returns the current UTC time.
  using Clock = boost::function<boost::posix_time::ptime()>;

  // Wraps the handler that is master now, with the system's UTC clock.
  TimestampTraceHandler();
  // Wraps `next`; an empty `clock` means the system's UTC clock.
  TimestampTraceHandler(TraceHandler& next, const Clock& clock);

  void HandleTrace(const UTF8String& message) override;
  TraceHandler& Next() const { return *next_; }

  // The prefix for `utc`, as described above.
  static UTF8String FormatPrefix(const boost::posix_time::ptime& utc);

 private:
  TraceHandler* next_;
  Clock clock_;
};

}  // namespace kelcore::debug
