#include <kelcore/debug/TimestampTraceHandler.h>

#include <boost/date_time/posix_time/posix_time_types.hpp>

#include <cstdio>

namespace kelcore::debug {

TimestampTraceHandler::TimestampTraceHandler()
    : TimestampTraceHandler(*GetMasterTraceHandler(), Clock()) {}

TimestampTraceHandler::TimestampTraceHandler(TraceHandler& next, const Clock& clock)
    : next_(&next), clock_(clock) {
  if (clock_.empty()) clock_ = &boost::posix_time::microsec_clock::universal_time;
}

UTF8String TimestampTraceHandler::FormatPrefix(const boost::posix_time::ptime& utc) {
  char text[48] = "";
  if (!utc.is_special()) {
    const boost::gregorian::date day = utc.date();
    const boost::posix_time::time_duration time = utc.time_of_day();
    std::snprintf(text, sizeof(text), "%04d-%02d-%02dT%02ld:%02ld:%02ld.%06ldZ ",
                  static_cast<int>(day.year()), static_cast<int>(day.month()),
                  static_cast<int>(day.day()), static_cast<long>(time.hours()),
                  static_cast<long>(time.minutes()), static_cast<long>(time.seconds()),
                  static_cast<long>(time.fractional_seconds() * 1000000 /
                                    boost::posix_time::time_duration::ticks_per_second()));
  }
  return UTF8String(reinterpret_cast<const unsigned char*>(text));
}

void TimestampTraceHandler::HandleTrace(const UTF8String& message) {
  UTF8String stamped = FormatPrefix(clock_());
  stamped.append(message);
  next_->HandleTrace(stamped);
}

}  // namespace kelcore::debug
