#include "logging/LogTimeText.h"

#include <boost/date_time/posix_time/posix_time_types.hpp>
#include <boost/date_time/posix_time/time_formatters.hpp>

#include <charconv>

namespace kelcore::logging {

namespace {

// Appends `value` in decimal, padded with zeros to `digits` digits.
void AppendPadded(std::string& text, long long value, int digits) {
  char buffer[24];
  const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
  const auto length = static_cast<int>(result.ptr - buffer);
  if (length < digits) text.append(static_cast<std::size_t>(digits - length), '0');
  text.append(buffer, result.ptr);
}

struct TimeParts {
  long long year, month, day, hours, minutes, seconds, micros;
};

TimeParts Split(const boost::posix_time::ptime& time) {
  const auto date = time.date().year_month_day();
  const auto clock = time.time_of_day();
  const long long perMicro = boost::posix_time::time_duration::ticks_per_second() / 1000000;
  return {date.year,
          date.month,
          date.day,
          clock.hours(),
          clock.minutes(),
          clock.seconds(),
          clock.fractional_seconds() / (perMicro > 0 ? perMicro : 1)};
}

}  // namespace

std::string FormatLogDateTime(const boost::posix_time::ptime& time) {
  if (time.is_special()) return boost::posix_time::to_simple_string(time);
  const TimeParts parts = Split(time);
  std::string text;
  AppendPadded(text, parts.year, 4);
  text += '-';
  AppendPadded(text, parts.month, 2);
  text += '-';
  AppendPadded(text, parts.day, 2);
  text += ' ';
  AppendPadded(text, parts.hours, 2);
  text += ':';
  AppendPadded(text, parts.minutes, 2);
  text += ':';
  AppendPadded(text, parts.seconds, 2);
  return text;
}

std::string FormatLogFileTimestamp(const boost::posix_time::ptime& time) {
  if (time.is_special()) return boost::posix_time::to_simple_string(time);
  const TimeParts parts = Split(time);
  std::string text;
  AppendPadded(text, parts.year, 4);
  AppendPadded(text, parts.month, 2);
  AppendPadded(text, parts.day, 2);
  text += '-';
  AppendPadded(text, parts.hours, 2);
  AppendPadded(text, parts.minutes, 2);
  AppendPadded(text, parts.seconds, 2);
  text += '_';
  AppendPadded(text, parts.micros, 6);
  return text;
}

}  // namespace kelcore::logging
