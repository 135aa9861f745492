#include <kelcore/filesupport/StringByteStream.h>

#include <algorithm>
#include <cstring>
#include <stdexcept>

#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {

IStringByteStream::IStringByteStream(std::string& text) : text_(text) {}

IStringByteStream::~IStringByteStream() = default;

unsigned char IStringByteStream::Get() {
  if (position_ >= text_.size()) throw eof_error();
  return static_cast<unsigned char>(text_[position_++]);
}

void IStringByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  const unsigned long long size = text_.size();
  const auto n = position_ < size ? std::min<unsigned long long>(size - position_, count) : 0;
  if (n != 0) std::memcpy(dst, text_.data() + position_, n);
  position_ += n;
  if (n < count) throw eof_error();
}

void IStringByteStream::CurPos(unsigned long long pos) {
  position_ = pos;
}

unsigned long long IStringByteStream::CurPos() const {
  return position_;
}

unsigned long long IStringByteStream::Length() const {
  return text_.size();
}

OStringByteStream::OStringByteStream(std::string& text) : text_(text) {}

OStringByteStream::~OStringByteStream() = default;

void OStringByteStream::Put(unsigned char byte) {
  text_.push_back(static_cast<char>(byte));
}

void OStringByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  text_.append(reinterpret_cast<const char*>(src), count);
}

void OStringByteStream::CurPos(unsigned long long) {}

unsigned long long OStringByteStream::CurPos() const {
  return text_.size();
}

void OStringByteStream::OSFlush() {}

void OStringByteStream::Truncate(unsigned long long length) {
  if (length > text_.max_size()) throw std::length_error("string too long");
  text_.resize(static_cast<std::string::size_type>(length), '\0');
}

}  // namespace kelcore::filesupport
