#include <kelcore/filesupport/CRCByteStream.h>

#include <cstdint>

#include "filesupport/Crc32Block.h"

namespace kelcore::filesupport {

// The running register and the byte-wise table, built per stream.
struct OCRCByteStream::State {
  std::uint32_t reg = 0xFFFFFFFFu;
  std::uint32_t table[256];

  State() {
    // The IEEE 802.3 generator's exponents; exponent e sets bit 31 - e of the reflected
    // polynomial (0xEDB88320).
    static constexpr int kExponents[] = {0, 1, 2, 4, 5, 7, 8, 10, 11, 12, 16, 22, 23, 26};
    std::uint32_t polynomial = 0;
    for (const int e : kExponents) polynomial |= 1u << (31 - e);
    for (std::uint32_t i = 0; i < 256; ++i) {
      std::uint32_t value = i;
      for (int bit = 0; bit < 8; ++bit) value = (value >> 1) ^ ((value & 1u) ? polynomial : 0u);
      table[i] = value;
    }
  }
};

OCRCByteStream::OCRCByteStream(OByteStream& target)
    : state_(std::make_unique<State>()), target_(target) {}

OCRCByteStream::~OCRCByteStream() = default;

void OCRCByteStream::Put(unsigned char byte) {
  state_->reg = (state_->reg >> 8) ^ state_->table[(state_->reg ^ byte) & 0xFFu];
  target_.Put(byte);
}

void OCRCByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  state_->reg = UpdateCrc32Block(state_->reg, src, count);
  target_.WriteBlock(src, count);
}

void OCRCByteStream::CurPos(unsigned long long pos) {
  target_.CurPos(pos);
}

unsigned long long OCRCByteStream::CurPos() const {
  return target_.CurPos();
}

unsigned long OCRCByteStream::Value() const {
  return state_->reg ^ 0xFFFFFFFFu;
}

}  // namespace kelcore::filesupport
