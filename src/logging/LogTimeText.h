// The texts of times that the console log writes: its header and footer lines and its
// time-stamped file names.
#pragma once

#include <boost/date_time/posix_time/ptime.hpp>

#include <string>

namespace kelcore::logging {

// "YYYY-MM-DD HH:MM:SS", e.g. "2026-11-22 07:57:32". A special value (not-a-date-time,
// infinity) gives boost's own text for it.
std::string FormatLogDateTime(const boost::posix_time::ptime& time);

// "%Y%m%d-%H%M%S_%f": "YYYYMMDD-HHMMSS_ffffff" with the fractional seconds in
// microseconds, e.g. "20261122-075732_000123". Special values as above.
std::string FormatLogFileTimestamp(const boost::posix_time::ptime& time);

}  // namespace kelcore::logging
