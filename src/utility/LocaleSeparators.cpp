#include <kelcore/utility/LocaleSeparators.h>

#include <kelcore/utility/NumericText.h>

#include <unicode/unum.h>

#include <atomic>
#include <cstdint>
#include <stdexcept>

namespace kelcore::utility {
namespace {

// Decimal separator in the low 16 bits, thousands separator in the high 16 bits; 0
// (no decimal separator) means not read yet.
std::atomic<std::uint32_t> gSeparators{0};

constexpr std::uint32_t Pack(UTF16Char decimal, UTF16Char thousands) {
  return static_cast<std::uint32_t>(decimal) | (static_cast<std::uint32_t>(thousands) << 16);
}

// First unit of one number symbol of the default locale; `fallback` when it cannot be
// read (an empty symbol gives 0).
UTF16Char FirstUnitOfSymbol(const UNumberFormat* format, UNumberFormatSymbol symbol,
                            UTF16Char fallback) {
  UChar buffer[8] = {};
  UErrorCode status = U_ZERO_ERROR;
  const int32_t length = unum_getSymbol(format, symbol, buffer, 8, &status);
  if (U_FAILURE(status) && status != U_BUFFER_OVERFLOW_ERROR) return fallback;
  return length > 0 ? static_cast<UTF16Char>(buffer[0]) : 0;
}

std::uint32_t ReadDefaultLocaleSeparators() {
  UTF16Char decimal = u'.';
  UTF16Char thousands = u',';
  UErrorCode status = U_ZERO_ERROR;
  UNumberFormat* format = unum_open(UNUM_DECIMAL, nullptr, 0, nullptr, nullptr, &status);
  if (U_SUCCESS(status) && format != nullptr) {
    decimal = FirstUnitOfSymbol(format, UNUM_DECIMAL_SEPARATOR_SYMBOL, u'.');
    thousands = FirstUnitOfSymbol(format, UNUM_GROUPING_SEPARATOR_SYMBOL, u',');
    if (decimal == 0) decimal = u'.';
  }
  if (format != nullptr) unum_close(format);
  return Pack(decimal, thousands);
}

std::uint32_t CurrentSeparators() {
  std::uint32_t packed = gSeparators.load(std::memory_order_acquire);
  if ((packed & 0xFFFF) != 0) return packed;
  std::uint32_t unread = 0;
  const std::uint32_t read = ReadDefaultLocaleSeparators();
  // A pair set meanwhile by SetLocaleSeparators is kept.
  if (gSeparators.compare_exchange_strong(unread, read, std::memory_order_acq_rel)) return read;
  return unread;
}

}  // namespace

LocaleSeparators GetLocaleSeparators() {
  const std::uint32_t packed = CurrentSeparators();
  return {static_cast<UTF16Char>(packed & 0xFFFF), static_cast<UTF16Char>(packed >> 16)};
}

void SetLocaleSeparators(UTF16Char decimal, UTF16Char thousands) {
  if (decimal == 0) throw std::invalid_argument("the decimal separator must not be NUL");
  gSeparators.store(Pack(decimal, thousands), std::memory_order_release);
}

void InternationalizeNum(UTF16String& text) {
  if (text.size() < 2) return;
  const LocaleSeparators separators = GetLocaleSeparators();
  for (std::size_t i = 0; i + 1 < text.size(); ++i) {
    if (!IsNumericChar(text[i + 1], true)) continue;
    if (text[i] == u'.') {
      text[i] = separators.decimal;
    } else if (text[i] == u',' && separators.thousands != 0) {
      text[i] = separators.thousands;
    }
  }
}

void DeInternationalizeNum(UTF16String& text) {
  ToNumericCase(text);
  const LocaleSeparators separators = GetLocaleSeparators();
  for (UTF16Char& unit : text) {
    if (unit == separators.decimal) {
      unit = u'.';
    } else if (separators.thousands != 0 && unit == separators.thousands) {
      unit = u',';
    }
  }
}

}  // namespace kelcore::utility
