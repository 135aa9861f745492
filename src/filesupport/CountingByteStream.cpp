#include <kelcore/filesupport/CountingByteStream.h>

#include <algorithm>

namespace kelcore::filesupport {

OCountingByteStream::OCountingByteStream() = default;

OCountingByteStream::~OCountingByteStream() = default;

void OCountingByteStream::Put(unsigned char) {
  ++position_;
  count_ = std::max(count_, position_);
}

void OCountingByteStream::WriteBlock(const unsigned char*, unsigned long count) {
  if (count == 0) return;
  position_ += count;
  count_ = std::max(count_, position_);
}

void OCountingByteStream::CurPos(unsigned long long pos) {
  position_ = pos;
}

unsigned long long OCountingByteStream::CurPos() const {
  return position_;
}

}  // namespace kelcore::filesupport
