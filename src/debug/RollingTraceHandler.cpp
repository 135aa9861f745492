#include <kelcore/debug/RollingTraceHandler.h>

#include "debug/ConsoleLogOutput.h"

#include <kelcore/debug/Trace.h>

#include <boost/date_time/posix_time/posix_time_types.hpp>

namespace kelcore::debug {

namespace {

class ConsoleLog : public RollingTraceHandler::Log {
 public:
  bool IsOpen() override { return ConsoleLogIsOpen(); }
  std::uint64_t Size() override { return ConsoleLogSize(); }
  void Roll() override { RollConsoleLog(); }
};

const unsigned char kWarningCategory[] = "RollingTraceHandler";
constexpr long kWarningVolume = 1;
const unsigned char kWarning[] =
    "Warning: Rolling the log file without using unique timestamped log file names. This may "
    "result in overwritten log files!\r\n";

}  // namespace

RollingTraceHandler::Log::~Log() = default;

RollingTraceHandler::RollingTraceHandler(const Options& options)
    : RollingTraceHandler(*GetMasterTraceHandler(), options, nullptr, Clock()) {}

RollingTraceHandler::RollingTraceHandler(TraceHandler& next, const Options& options,
                                         std::shared_ptr<Log> log, const Clock& clock)
    : next_(&next), options_(options), log_(std::move(log)), clock_(clock) {
  if (!log_) log_ = std::make_shared<ConsoleLog>();
  if (clock_.empty()) clock_ = [] { return boost::posix_time::microsec_clock::local_time(); };
}

void RollingTraceHandler::HandleTrace(const UTF8String& message) {
  if (RollIfDue() && !options_.timestampedLogNames &&
      TraceEnabled(kWarningCategory, kWarningVolume, true)) {
    Trace(kWarning);
  }
  next_->HandleTrace(message);
}

bool RollingTraceHandler::RollIfDue() {
  std::lock_guard<std::mutex> hold(lock_);
  bool due = false;
  if (options_.rollDaily) {
    const boost::gregorian::date today = clock_().date();
    if (!lastDate_.is_special() && today != lastDate_) {
      due = log_->IsOpen() || options_.createMissingLogs;
    }
    lastDate_ = today;
  }
  if (!due && options_.maxLogSize > 0 && log_->IsOpen()) {
    due = log_->Size() >= options_.maxLogSize;
  }
  if (due) log_->Roll();
  return due;
}

}  // namespace kelcore::debug
