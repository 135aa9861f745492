#include <kelcore/filesupport/BufferByteStream.h>

#include <algorithm>
#include <cstring>

#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {
namespace {

// How many of `wanted` bytes fit between `position` and `end`.
unsigned long long Available(unsigned long long position, unsigned long long end,
                             unsigned long long wanted) {
  return position < end ? std::min(end - position, wanted) : 0;
}

}  // namespace

IBufferByteStream::IBufferByteStream(const unsigned char* data, unsigned long long size)
    : data_(data), size_(size) {}

IBufferByteStream::~IBufferByteStream() = default;

unsigned char IBufferByteStream::Get() {
  if (position_ >= size_) throw eof_error();
  return data_[position_++];
}

void IBufferByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  const auto n = Available(position_, size_, count);
  if (n != 0) std::memcpy(dst, data_ + position_, n);
  position_ += n;
  if (n < count) throw eof_error();
}

void IBufferByteStream::CurPos(unsigned long long pos) {
  position_ = pos;
}

unsigned long long IBufferByteStream::CurPos() const {
  return position_;
}

unsigned long long IBufferByteStream::Length() const {
  return size_;
}

OBufferByteStream::OBufferByteStream(unsigned char* data, unsigned long long capacity)
    : data_(data), capacity_(capacity) {}

OBufferByteStream::~OBufferByteStream() = default;

void OBufferByteStream::RaiseCount() {
  count_ = std::max(count_, position_);
}

void OBufferByteStream::Put(unsigned char byte) {
  if (position_ >= capacity_) throw eof_error();
  data_[position_++] = byte;
  RaiseCount();
}

void OBufferByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  const auto n = Available(position_, capacity_, count);
  if (n != 0) std::memcpy(data_ + position_, src, n);
  position_ += n;
  RaiseCount();
  if (n < count) throw eof_error();
}

void OBufferByteStream::CurPos(unsigned long long pos) {
  position_ = pos;
  RaiseCount();
}

unsigned long long OBufferByteStream::CurPos() const {
  return position_;
}

unsigned long long OBufferByteStream::Length() const {
  return capacity_;
}

}  // namespace kelcore::filesupport
