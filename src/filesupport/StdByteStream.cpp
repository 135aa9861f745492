#include <kelcore/filesupport/StdByteStream.h>

namespace kelcore::filesupport {
namespace {

unsigned long long AsPosition(std::streampos pos) {
  return static_cast<unsigned long long>(static_cast<std::streamoff>(pos));
}

std::streampos AsStreamPos(unsigned long long pos) {
  return std::streampos(static_cast<std::streamoff>(pos));
}

}  // namespace

IStdByteStream::IStdByteStream(std::istream& stream) : stream_(stream) {}

IStdByteStream::~IStdByteStream() = default;

unsigned char IStdByteStream::Get() {
  return static_cast<unsigned char>(stream_.get());
}

void IStdByteStream::CurPos(unsigned long long pos) {
  stream_.seekg(AsStreamPos(pos));
}

unsigned long long IStdByteStream::CurPos() const {
  return AsPosition(stream_.tellg());
}

unsigned long long IStdByteStream::Length() const {
  const std::streampos here = stream_.tellg();
  stream_.seekg(0, std::ios::end);
  const std::streampos end = stream_.tellg();
  stream_.seekg(here);
  return AsPosition(end);
}

OStdByteStream::OStdByteStream(std::ostream& stream) : stream_(stream) {}

OStdByteStream::~OStdByteStream() = default;

void OStdByteStream::Put(unsigned char byte) {
  stream_.put(static_cast<char>(byte));
}

void OStdByteStream::CurPos(unsigned long long pos) {
  stream_.seekp(AsStreamPos(pos));
}

unsigned long long OStdByteStream::CurPos() const {
  return AsPosition(stream_.tellp());
}

}  // namespace kelcore::filesupport
