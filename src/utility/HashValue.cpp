#include <kelcore/utility/HashValue.h>

#include <bit>
#include <cstring>
#include <istream>
#include <limits>
#include <ostream>
#include <stdexcept>
#include <vector>

namespace kelcore::utility {
namespace {

constexpr std::uint32_t kGoldenRatio = 0x9E3779B9;

// lookup2's reversible mix of three words.
inline void Mix(std::uint32_t& a, std::uint32_t& b, std::uint32_t& c) {
  // clang-format off
  a -= b; a -= c; a ^= (c >> 13);
  b -= c; b -= a; b ^= (a << 8);
  c -= a; c -= b; c ^= (b >> 13);
  a -= b; a -= c; a ^= (c >> 12);
  b -= c; b -= a; b ^= (a << 16);
  c -= a; c -= b; c ^= (b >> 5);
  a -= b; a -= c; a ^= (c >> 3);
  b -= c; b -= a; b ^= (a << 10);
  c -= a; c -= b; c ^= (b >> 15);
  // clang-format on
}

inline std::uint32_t LittleEndianWord(const unsigned char* bytes) {
  return static_cast<std::uint32_t>(bytes[0]) | (static_cast<std::uint32_t>(bytes[1]) << 8) |
         (static_cast<std::uint32_t>(bytes[2]) << 16) |
         (static_cast<std::uint32_t>(bytes[3]) << 24);
}

// Adds whole 12-byte blocks, leaving `data` and `remaining` after the last one.
template <bool kAligned>
void MixBlocks(std::uint32_t& a, std::uint32_t& b, std::uint32_t& c, const unsigned char*& data,
               unsigned int& remaining) {
  for (; remaining >= 12; data += 12, remaining -= 12) {
    if constexpr (kAligned) {
      std::uint32_t words[3];
      std::memcpy(words, data, sizeof words);  // aligned word loads
      a += words[0];
      b += words[1];
      c += words[2];
    } else {
      a += LittleEndianWord(data);
      b += LittleEndianWord(data + 4);
      c += LittleEndianWord(data + 8);
    }
    Mix(a, b, c);
  }
}

template <typename Text>
void MixInUnits(HashValue& value, const Text& text) {
  MixHash::MixInBytes(value, text.data(), text.size() * sizeof(typename Text::value_type));
}

}  // namespace

void MixHash::MixInData(HashValue& value, const unsigned char* data, unsigned int length) {
  std::uint32_t a = kGoldenRatio;
  std::uint32_t b = kGoldenRatio;
  std::uint32_t c = value.words[0];
  unsigned int remaining = length;
  const bool aligned = std::endian::native == std::endian::little &&
                       reinterpret_cast<std::uintptr_t>(data) % alignof(std::uint32_t) == 0;
  if (aligned) {
    MixBlocks<true>(a, b, c, data, remaining);
  } else {
    MixBlocks<false>(a, b, c, data, remaining);
  }

  c += length;
  // The last 1 to 11 bytes; c's lowest byte is taken by the length.
  switch (remaining) {
    case 11:
      c += static_cast<std::uint32_t>(data[10]) << 24;
      [[fallthrough]];
    case 10:
      c += static_cast<std::uint32_t>(data[9]) << 16;
      [[fallthrough]];
    case 9:
      c += static_cast<std::uint32_t>(data[8]) << 8;
      [[fallthrough]];
    case 8:
      b += static_cast<std::uint32_t>(data[7]) << 24;
      [[fallthrough]];
    case 7:
      b += static_cast<std::uint32_t>(data[6]) << 16;
      [[fallthrough]];
    case 6:
      b += static_cast<std::uint32_t>(data[5]) << 8;
      [[fallthrough]];
    case 5:
      b += data[4];
      [[fallthrough]];
    case 4:
      a += static_cast<std::uint32_t>(data[3]) << 24;
      [[fallthrough]];
    case 3:
      a += static_cast<std::uint32_t>(data[2]) << 16;
      [[fallthrough]];
    case 2:
      a += static_cast<std::uint32_t>(data[1]) << 8;
      [[fallthrough]];
    case 1:
      a += data[0];
      [[fallthrough]];
    default:
      break;
  }
  Mix(a, b, c);

  std::uint32_t word0 = c;
  std::uint32_t word1 = value.words[1];
  std::uint32_t word2 = value.words[2];
  Mix(word0, word1, word2);
  value.words[0] = word0;
  value.words[1] = word1;
  value.words[2] = word2;
}

void MixHash::MixInBytes(HashValue& value, const void* data, std::size_t size) {
  if (size > std::numeric_limits<unsigned int>::max()) {
    throw std::length_error("MixHash: more than 2^32-1 bytes in one call");
  }
  static const unsigned char kNothing = 0;
  const auto* bytes = size == 0 ? &kNothing : static_cast<const unsigned char*>(data);
  MixInData(value, bytes, static_cast<unsigned int>(size));
}

void MixHash::MixIn(HashValue& value, const UTF16String& text) {
  if constexpr (std::endian::native == std::endian::little) {
    MixInUnits(value, text);
  } else {
    std::vector<unsigned char> bytes;
    bytes.reserve(text.size() * 2);
    for (UTF16Char unit : text) {
      bytes.push_back(static_cast<unsigned char>(unit & 0xFF));
      bytes.push_back(static_cast<unsigned char>(unit >> 8));
    }
    MixInBytes(value, bytes.data(), bytes.size());
  }
}

void MixHash::MixIn(HashValue& value, const UTF8String& text) {
  MixInUnits(value, text);
}
void MixHash::MixIn(HashValue& value, const std::string& text) {
  MixInUnits(value, text);
}

void MixHash::MixIn(HashValue& value, std::uint32_t number) {
  unsigned char bytes[4];
  for (int i = 0; i < 4; ++i) bytes[i] = static_cast<unsigned char>(number >> (8 * i));
  MixInData(value, bytes, sizeof bytes);
}

void MixHash::MixIn(HashValue& value, std::uint64_t number) {
  unsigned char bytes[8];
  for (int i = 0; i < 8; ++i) bytes[i] = static_cast<unsigned char>(number >> (8 * i));
  MixInData(value, bytes, sizeof bytes);
}

std::ostream& operator<<(std::ostream& stream, const HashValue& value) {
  return stream << value.words[0] << ' ' << value.words[1] << ' ' << value.words[2];
}

std::istream& operator>>(std::istream& stream, HashValue& value) {
  unsigned long long read[3] = {};
  for (unsigned long long& word : read) {
    // A leading "-" would wrap; refuse it like any other non-digit.
    stream >> std::ws;
    if (stream.peek() == '-') {
      stream.setstate(std::ios_base::failbit);
      return stream;
    }
    if (!(stream >> word) || word > std::numeric_limits<std::uint32_t>::max()) {
      stream.setstate(std::ios_base::failbit);
      return stream;
    }
  }
  for (int i = 0; i < 3; ++i) value.words[i] = static_cast<std::uint32_t>(read[i]);
  return stream;
}

}  // namespace kelcore::utility
