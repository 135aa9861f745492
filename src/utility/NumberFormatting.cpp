#include <kelcore/utility/NumberFormatting.h>

#include <kelcore/utility/LocaleSeparators.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <stdexcept>
#include <string>
#include <string_view>

namespace kelcore::utility {
namespace {

// Enough fraction digits to write any double exactly.
constexpr unsigned int kMaxFractionDigits = 1074;
constexpr long kMaxIntegerDigits = 400;
// Integer digits of the largest double, plus sign and point.
constexpr std::size_t kFixedOverhead = 312;

void AppendGroupedDigits(UTF16String& out, std::string_view digits, UTF16Char separator) {
  for (std::size_t i = 0; i < digits.size(); ++i) {
    if (separator != 0 && i != 0 && (digits.size() - i) % 3 == 0) out.push_back(separator);
    out.push_back(static_cast<UTF16Char>(digits[i]));
  }
}

}  // namespace

UTF16String NumberToString(double value, unsigned int minFractionDigits,
                           unsigned int maxFractionDigits, NumberFlags flags,
                           long minIntegerDigits) {
  if (!std::isfinite(value)) {
    throw std::domain_error("NumberToString: an infinite or NaN value has no number text");
  }
  minFractionDigits = std::min(minFractionDigits, kMaxFractionDigits);
  maxFractionDigits = std::clamp(maxFractionDigits, minFractionDigits, kMaxFractionDigits);

  std::string fixed(kFixedOverhead + maxFractionDigits, '\0');
  const std::to_chars_result written =
      std::to_chars(fixed.data(), fixed.data() + fixed.size(), value, std::chars_format::fixed,
                    static_cast<int>(maxFractionDigits));
  if (written.ec != std::errc()) throw std::length_error("NumberToString: buffer too small");
  std::string_view text(fixed.data(), static_cast<std::size_t>(written.ptr - fixed.data()));

  bool negative = false;
  if (!text.empty() && text.front() == '-') {
    negative = true;
    text.remove_prefix(1);
  }
  const std::size_t point = text.find('.');
  std::string_view integerDigits = text.substr(0, point);
  std::string_view fractionDigits =
      point == std::string_view::npos ? std::string_view() : text.substr(point + 1);
  while (fractionDigits.size() > minFractionDigits && fractionDigits.back() == '0') {
    fractionDigits.remove_suffix(1);
  }
  const auto isZero = [](char digit) { return digit == '0'; };
  if (std::all_of(integerDigits.begin(), integerDigits.end(), isZero) &&
      std::all_of(fractionDigits.begin(), fractionDigits.end(), isZero)) {
    negative = false;
  }

  const LocaleSeparators separators =
      flags.Test(kNumberPlainASCII) ? LocaleSeparators{u'.', u','} : GetLocaleSeparators();
  const UTF16Char groupSeparator =
      flags.Test(kNumberGroupThousands) ? separators.thousands : UTF16Char{0};

  const long padding =
      std::min(minIntegerDigits, kMaxIntegerDigits) - static_cast<long>(integerDigits.size());
  std::string integerText(padding > 0 ? static_cast<std::size_t>(padding) : 0, '0');
  integerText.append(integerDigits);

  UTF16String out;
  out.reserve(integerText.size() * 4 / 3 + fractionDigits.size() + 2);
  if (negative) out.push_back(u'-');
  AppendGroupedDigits(out, integerText, groupSeparator);
  if (!fractionDigits.empty()) {
    out.push_back(separators.decimal);
    for (char digit : fractionDigits) out.push_back(static_cast<UTF16Char>(digit));
  }
  return out;
}

}  // namespace kelcore::utility
