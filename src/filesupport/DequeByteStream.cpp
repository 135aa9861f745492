#include <kelcore/filesupport/DequeByteStream.h>

#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {

IDequeByteStream::IDequeByteStream(std::deque<unsigned char>& bytes) : bytes_(bytes) {}

IDequeByteStream::~IDequeByteStream() = default;

unsigned char IDequeByteStream::Get() {
  if (index_ >= bytes_.size()) throw eof_error();
  return bytes_[index_++];
}

void IDequeByteStream::CurPos(unsigned long long pos) {
  index_ = pos;
}

unsigned long long IDequeByteStream::CurPos() const {
  return index_;
}

unsigned long long IDequeByteStream::Length() const {
  return bytes_.size();
}

ODequeByteStream::ODequeByteStream(std::deque<unsigned char>& bytes) : bytes_(bytes) {}

ODequeByteStream::~ODequeByteStream() = default;

void ODequeByteStream::Put(unsigned char byte) {
  bytes_.push_back(byte);
}

void ODequeByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  bytes_.insert(bytes_.end(), src, src + count);
}

void ODequeByteStream::CurPos(unsigned long long) {}

unsigned long long ODequeByteStream::CurPos() const {
  return bytes_.size();
}

}  // namespace kelcore::filesupport
