// RollingTraceHandler: starts a new log file when the log grows too large or a new day
// begins, then passes each message on unchanged.
//
// Before each message is passed on, the handler decides whether to roll the log:
//   - by size, when options.maxLogSize > 0, a log is open and it already holds
//     maxLogSize bytes or more. A log thus exceeds the limit by at most one message (and
//     whatever the log adds to it), and every log gets at least the message that made it;
//   - daily, when options.rollDaily is set and the local date of the clock differs from
//     the date of the previous message this handler saw (the first message only records
//     its date). A daily roll happens when a log is open, or, with
//     options.createMissingLogs, also when none is open (a new one is made).
// Rolling closes the open log and opens the default log afresh, creating it (see
// ConsoleLogFile::OpenDefaultLogFile). Without time-stamped log file names
// (options.timestampedLogNames false) the new log takes the old one's name and the old
// one is rotated to the " Log-last.txt" name, so older logs are overwritten; after such a
// roll the handler traces, in the category "RollingTraceHandler" at volume 1, the text
// "Warning: Rolling the log file without using unique timestamped log file names. This
// may result in overwritten log files!" followed by CR LF. The warning is traced after
// the roll and before the message that caused it, so both land in the new log.
//
// Threads: any number of threads may trace at once; the decision and the roll are made
// under the handler's lock, the message is passed on outside it. The next handler must
// outlive this one.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/TraceHandler.h>

#include <boost/date_time/gregorian/greg_date.hpp>
#include <boost/date_time/posix_time/ptime.hpp>
#include <boost/function.hpp>

#include <cstdint>
#include <memory>
#include <mutex>

namespace kelcore::debug {

class KELCORE_API RollingTraceHandler : public TraceHandler {
 public:
  struct Options {
    std::uint64_t maxLogSize = 0;  // bytes; 0 = never roll by size
    bool rollDaily = false;
    bool createMissingLogs = false;
    bool timestampedLogNames = false;  // the log's names are unique (no warning)
  };

  // The log that is rolled. The default one is the console log file.
  class KELCORE_API Log {
   public:
    virtual ~Log();
    virtual bool IsOpen() = 0;
    // Bytes in the open log; 0 when none is open or its size cannot be had.
    virtual std::uint64_t Size() = 0;
    // Closes the open log, if any, and opens a new one.
    virtual void Roll() = 0;
  };

  // Returns the current local time.
  using Clock = boost::function<boost::posix_time::ptime()>;

  // Wraps the handler that is master now, rolling the console log file by the local
  // clock.
  explicit RollingTraceHandler(const Options& options);
  // Wraps `next`, rolling `log` (the console log file when null) by `clock` (the system's
  // local time when empty).
  RollingTraceHandler(TraceHandler& next, const Options& options, std::shared_ptr<Log> log,
                      const Clock& clock);

  void HandleTrace(const UTF8String& message) override;
  TraceHandler& Next() const { return *next_; }
  const Options& GetOptions() const { return options_; }

 private:
  // Decides and rolls under the lock; true when the log was rolled.
  bool RollIfDue();

  TraceHandler* next_;
  Options options_;
  std::shared_ptr<Log> log_;
  Clock clock_;
  std::mutex lock_;
  boost::gregorian::date lastDate_;  // not-a-date until the first message
};

}  // namespace kelcore::debug
