#include <kelcore/config/Errors.h>
#include <kelcore/utility/Guid.h>

#include <cstring>
#include <stdexcept>

#if defined(_WIN32)
#include "win/GuidRandom.inc"
#else
#include "posix/GuidRandom.inc"
#endif

namespace kelcore::utility {

namespace {

constexpr char kCouldntCreateGuidKey[] =
    "$$$/kelcore/utility/Error/CouldntCreateGUID=Couldn't create Guid.";
constexpr unsigned long kUtilityComponent = 105;
constexpr long kCouldntCreateGuidError = 27;

constexpr char kDigits[] = "0123456789abcdef";

// Digit values of the characters below 'h' (0x68): hexadecimal digits have their value,
// every other character reads as 0. Characters from 'h' upward also read as 0.
constexpr std::array<unsigned char, 104> MakeDigitTable() {
  std::array<unsigned char, 104> table{};
  for (int c = '0'; c <= '9'; ++c) table[c] = static_cast<unsigned char>(c - '0');
  for (int c = 'A'; c <= 'F'; ++c) table[c] = static_cast<unsigned char>(c - 'A' + 10);
  for (int c = 'a'; c <= 'f'; ++c) table[c] = static_cast<unsigned char>(c - 'a' + 10);
  return table;
}
constexpr std::array<unsigned char, 104> kDigitTable = MakeDigitTable();

unsigned DigitAt(std::string_view text, std::size_t position) {
  const auto unit = static_cast<unsigned char>(text[position]);
  return unit < kDigitTable.size() ? kDigitTable[unit] : 0;
}

// `count` digits from `position`, high digit first.
std::uint32_t HexAt(std::string_view text, std::size_t position, std::size_t count) {
  std::uint32_t value = 0;
  for (std::size_t i = 0; i < count; ++i) value = (value << 4) | DigitAt(text, position + i);
  return value;
}

void Require(bool parsed) {
  if (!parsed) throw std::invalid_argument("Guid text must hold at least 36 characters");
}

// Byte positions of data4 in the text form.
constexpr std::size_t kData4Positions[8] = {19, 21, 24, 26, 28, 30, 32, 34};

}  // namespace

Guid::Guid(std::uint32_t data1, std::uint16_t data2, std::uint16_t data3, unsigned char b0,
           unsigned char b1, unsigned char b2, unsigned char b3, unsigned char b4, unsigned char b5,
           unsigned char b6, unsigned char b7)
    : data1_(data1), data2_(data2), data3_(data3), data4_{b0, b1, b2, b3, b4, b5, b6, b7} {}

Guid::Guid(const std::string& text) {
  Require(Parse(text, *this));
}

Guid::Guid(const char* text) {
  if (text != nullptr) Require(Parse(text, *this));
}

Guid::Guid(const UTF8String& text)
    : Guid(std::string(reinterpret_cast<const char*>(text.data()), text.size())) {}

Guid::Guid(const UTF16String& text) : Guid(UTF16to8(text)) {}

bool Guid::Parse(std::string_view text, Guid& out) {
  if (text.empty()) {
    out = Guid();
    return true;
  }
  if (text.size() < kTextLength) return false;
  out.data1_ = HexAt(text, 0, 8);
  out.data2_ = static_cast<std::uint16_t>(HexAt(text, 9, 4));
  out.data3_ = static_cast<std::uint16_t>(HexAt(text, 14, 4));
  for (std::size_t i = 0; i < 8; ++i) {
    out.data4_[i] = static_cast<unsigned char>(HexAt(text, kData4Positions[i], 2));
  }
  return true;
}

Guid Guid::CreateUnique() {
  unsigned char bytes[kByteLength] = {};
  const bool filled = FillWithRandomBytes(bytes, sizeof bytes);
  if (filled) {
    // Version 4 (random), variant 1 (RFC 4122) as the byte form places them.
    bytes[6] = static_cast<unsigned char>((bytes[6] & 0x0F) | 0x40);
    bytes[8] = static_cast<unsigned char>((bytes[8] & 0x3F) | 0x80);
  }
  Guid guid;
  GuidFromBytes(guid, bytes);
  if (!filled) {
    config::ThrowError(config::kErrorLevelNonFatal, kCouldntCreateGuidKey, kUtilityComponent,
                       kCouldntCreateGuidError, true);
  }
  return guid;
}

UTF8String Guid::AsUTF8String() const {
  unsigned char bytes[kByteLength];
  GuidToBytes(*this, bytes);
  UTF8String text;
  text.reserve(kTextLength);
  for (std::size_t i = 0; i < kByteLength; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text.push_back('-');
    text.push_back(static_cast<unsigned char>(kDigits[bytes[i] >> 4]));
    text.push_back(static_cast<unsigned char>(kDigits[bytes[i] & 0x0F]));
  }
  return text;
}

UTF16String Guid::AsString() const {
  const UTF8String text = AsUTF8String();
  return UTF16String(text.begin(), text.end());
}

void Guid::GuidToBytes(const Guid& guid, unsigned char* out16) {
  for (int i = 0; i < 4; ++i) out16[i] = static_cast<unsigned char>(guid.data1_ >> (24 - 8 * i));
  out16[4] = static_cast<unsigned char>(guid.data2_ >> 8);
  out16[5] = static_cast<unsigned char>(guid.data2_);
  out16[6] = static_cast<unsigned char>(guid.data3_ >> 8);
  out16[7] = static_cast<unsigned char>(guid.data3_);
  std::memcpy(out16 + 8, guid.data4_.data(), guid.data4_.size());
}

void Guid::GuidFromBytes(Guid& guid, const unsigned char* in16) {
  guid.data1_ = (std::uint32_t{in16[0]} << 24) | (std::uint32_t{in16[1]} << 16) |
                (std::uint32_t{in16[2]} << 8) | in16[3];
  guid.data2_ = static_cast<std::uint16_t>((in16[4] << 8) | in16[5]);
  guid.data3_ = static_cast<std::uint16_t>((in16[6] << 8) | in16[7]);
  std::memcpy(guid.data4_.data(), in16 + 8, guid.data4_.size());
}

void Guid::GuidToComponents(const Guid& guid, std::uint32_t& data1, std::uint16_t& data2,
                            std::uint16_t& data3, unsigned char& b0, unsigned char& b1,
                            unsigned char& b2, unsigned char& b3, unsigned char& b4,
                            unsigned char& b5, unsigned char& b6, unsigned char& b7) {
  data1 = guid.data1_;
  data2 = guid.data2_;
  data3 = guid.data3_;
  b0 = guid.data4_[0];
  b1 = guid.data4_[1];
  b2 = guid.data4_[2];
  b3 = guid.data4_[3];
  b4 = guid.data4_[4];
  b5 = guid.data4_[5];
  b6 = guid.data4_[6];
  b7 = guid.data4_[7];
}

std::size_t Guid::Hash() const noexcept {
  unsigned char bytes[kByteLength];
  GuidToBytes(*this, bytes);
  // FNV-1a over the byte form.
  std::uint64_t hash = 0xcbf29ce484222325ULL;
  for (const unsigned char byte : bytes) {
    hash = (hash ^ byte) * 0x100000001b3ULL;
  }
  return static_cast<std::size_t>(hash);
}

}  // namespace kelcore::utility
