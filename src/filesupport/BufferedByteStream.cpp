#include <kelcore/filesupport/BufferedByteStream.h>

#include <algorithm>
#include <cstring>
#include <stdexcept>
#include <typeinfo>

#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {
namespace {

std::uint32_t CheckedBufferSize(unsigned long size) {
  if (size == 0 || size > UINT32_MAX) {
    throw std::invalid_argument("buffered stream: the buffer size must be in [1, 2^32 - 1]");
  }
  return static_cast<std::uint32_t>(size);
}

std::uint32_t CheckedAlignment(unsigned long alignment, unsigned long bufferSize) {
  if (alignment == 0 || alignment > bufferSize) {
    throw std::invalid_argument("buffered stream: the alignment must be in [1, buffer size]");
  }
  return static_cast<std::uint32_t>(alignment);
}

}  // namespace

// While the get area is open, gptr_ carries the position: position_ is brought up to date
// (and the area closed) before anything else looks at it.

IBufferedByteStream::IBufferedByteStream(IByteStream& source, unsigned long bufferSize,
                                         unsigned long alignment)
    : source_(source),
      bufferSize_(CheckedBufferSize(bufferSize)),
      alignment_(CheckedAlignment(alignment, bufferSize)),
      sourceLength_(source.Length()) {
  buffer_ = std::make_unique_for_overwrite<unsigned char[]>(bufferSize_);
}

IBufferedByteStream::~IBufferedByteStream() = default;

void IBufferedByteStream::SyncFromGetArea() {
  if (gptr_ == nullptr) return;
  position_ = bufferOffset_ + static_cast<std::uint64_t>(gptr_ - buffer_.get());
  gptr_ = egptr_ = nullptr;
}

// Only this class's own Get/FillBuffer may be bypassed by the area.
void IBufferedByteStream::OpenGetArea() {
  if (typeid(*this) != typeid(IBufferedByteStream)) return;
  if (position_ < bufferOffset_ || position_ - bufferOffset_ >= validBytes_) return;
  gptr_ = buffer_.get() + (position_ - bufferOffset_);
  egptr_ = buffer_.get() + validBytes_;
}

unsigned char IBufferedByteStream::Get() {
  if (gptr_ != egptr_) return *gptr_++;
  SyncFromGetArea();
  if (position_ >= sourceLength_) throw eof_error();
  FillBuffer(position_, 1);
  const unsigned char byte = buffer_[position_ - bufferOffset_];
  ++position_;
  OpenGetArea();
  return byte;
}

void IBufferedByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  if (count == 0) return;
  const bool buffered = count <= bufferSize_ - alignment_;
  if (buffered && static_cast<unsigned long>(egptr_ - gptr_) >= count) {
    std::memcpy(dst, gptr_, count);
    gptr_ += count;
    return;
  }
  SyncFromGetArea();
  if (buffered) {
    FillBuffer(position_, count);
    std::memcpy(dst, buffer_.get() + (position_ - bufferOffset_), count);
  } else {
    source_.CurPos(position_);
    source_.ReadBlock(dst, count);
  }
  position_ += count;
  OpenGetArea();
}

void IBufferedByteStream::CurPos(unsigned long long pos) {
  if (pos > sourceLength_) throw eof_error();
  SyncFromGetArea();
  position_ = pos;
  OpenGetArea();
}

unsigned long long IBufferedByteStream::CurPos() const {
  if (gptr_ == nullptr) return position_;
  return bufferOffset_ + static_cast<std::uint64_t>(gptr_ - buffer_.get());
}

unsigned long long IBufferedByteStream::Length() const {
  return sourceLength_;
}

void IBufferedByteStream::FillBuffer(unsigned long long pos, unsigned long count) {
  if (pos >= bufferOffset_ && pos + count <= bufferOffset_ + validBytes_) return;

  std::uint64_t start = pos - pos % alignment_;
  // Keep one alignment unit before the position when the request still fits after it.
  if (start + (bufferSize_ - alignment_) > pos + count && start > alignment_) start -= alignment_;
  const std::uint64_t length =
      start < sourceLength_ ? std::min<std::uint64_t>(bufferSize_, sourceLength_ - start) : 0;
  const std::uint64_t end = start + length;

  // The bytes both windows cover stay; only the rest is read. Until the reads succeed the
  // buffer counts as empty, so an error of the source leaves a consistent stream.
  const std::uint64_t keptBegin = std::max<std::uint64_t>(start, bufferOffset_);
  const std::uint64_t keptEnd = std::min<std::uint64_t>(end, bufferOffset_ + validBytes_);
  unsigned char* const buffer = buffer_.get();
  const auto read = [&](std::uint64_t from, std::uint64_t to) {
    if (from == to) return;
    source_.CurPos(from);
    source_.ReadBlock(buffer + (from - start), static_cast<unsigned long>(to - from));
  };
  if (keptBegin < keptEnd) {
    std::memmove(buffer + (keptBegin - start), buffer + (keptBegin - bufferOffset_),
                 keptEnd - keptBegin);
    validBytes_ = 0;
    read(start, keptBegin);
    read(keptEnd, end);
  } else {
    validBytes_ = 0;
    read(start, end);
  }
  bufferOffset_ = start;
  validBytes_ = static_cast<std::uint32_t>(length);
}

// While the put area is open, pptr_ carries the position and the furthest byte written
// into the buffer; both are taken over before anything else looks at them.

OBufferedByteStream::OBufferedByteStream(OByteStream& target, unsigned long bufferSize,
                                         unsigned long alignment)
    : target_(target), bufferSize_(CheckedBufferSize(bufferSize)) {
  if (alignment > UINT32_MAX) {
    throw std::invalid_argument("buffered stream: the alignment must be below 2^32");
  }
  alignment_ = static_cast<std::uint32_t>(alignment);
  buffer_ = std::make_unique_for_overwrite<unsigned char[]>(bufferSize_);
}

OBufferedByteStream::~OBufferedByteStream() {
  SyncFromPutArea();
  WriteBuffered();
}

void OBufferedByteStream::SyncFromPutArea() {
  if (pptr_ == nullptr) return;
  const auto index = static_cast<std::uint32_t>(pptr_ - buffer_.get());
  position_ = bufferOffset_ + index;
  bufferedCount_ = std::max(bufferedCount_, index);
  pptr_ = epptr_ = nullptr;
}

// An empty buffer starts at the position, as the next write would make it.
void OBufferedByteStream::OpenPutArea() {
  if (typeid(*this) != typeid(OBufferedByteStream)) return;
  if (bufferedCount_ == 0) {
    bufferOffset_ = position_;
  } else if (position_ < bufferOffset_ || position_ - bufferOffset_ >= bufferSize_) {
    return;
  }
  pptr_ = buffer_.get() + (position_ - bufferOffset_);
  epptr_ = buffer_.get() + bufferSize_;
}

void OBufferedByteStream::WriteBuffered() {
  if (bufferedCount_ == 0) return;
  target_.CurPos(bufferOffset_);
  target_.WriteBlock(buffer_.get(), bufferedCount_);
  bufferedCount_ = 0;
}

void OBufferedByteStream::FlushAndSync() {
  Flush();
  SyncFromPutArea();
}

// `count` is at most the buffer size.
void OBufferedByteStream::Store(const unsigned char* src, unsigned long count) {
  if (bufferedCount_ != 0 && position_ - bufferOffset_ + count > bufferSize_) FlushAndSync();
  if (bufferedCount_ == 0) {
    bufferOffset_ = position_;
  } else if (position_ < bufferOffset_ || position_ - bufferOffset_ + count > bufferSize_) {
    throw std::logic_error("buffered stream: Flush left bytes in the buffer");
  }
  std::memcpy(buffer_.get() + (position_ - bufferOffset_), src, count);
  position_ += count;
  bufferedCount_ = std::max(bufferedCount_, static_cast<std::uint32_t>(position_ - bufferOffset_));
}

void OBufferedByteStream::Put(unsigned char byte) {
  if (pptr_ != epptr_) {
    *pptr_++ = byte;
    return;
  }
  SyncFromPutArea();
  Store(&byte, 1);
  OpenPutArea();
}

void OBufferedByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  if (count == 0) return;
  if (static_cast<unsigned long>(epptr_ - pptr_) >= count) {
    std::memcpy(pptr_, src, count);
    pptr_ += count;
    return;
  }
  SyncFromPutArea();
  if (count <= bufferSize_) {
    Store(src, count);
  } else {
    if (bufferedCount_ != 0) FlushAndSync();
    target_.CurPos(position_);
    target_.WriteBlock(src, count);
    position_ += count;
  }
  OpenPutArea();
}

void OBufferedByteStream::CurPos(unsigned long long pos) {
  SyncFromPutArea();
  const bool insideBuffered =
      bufferedCount_ != 0 && pos >= bufferOffset_ && pos - bufferOffset_ <= bufferedCount_;
  if (!insideBuffered) FlushAndSync();
  position_ = pos;
  OpenPutArea();
}

unsigned long long OBufferedByteStream::CurPos() const {
  if (pptr_ == nullptr) return position_;
  return bufferOffset_ + static_cast<std::uint64_t>(pptr_ - buffer_.get());
}

void OBufferedByteStream::OSFlush() {
  Flush();
  target_.OSFlush();
}

void OBufferedByteStream::Truncate(unsigned long long length) {
  Flush();
  target_.Truncate(length);
}

void OBufferedByteStream::Flush() {
  SyncFromPutArea();
  WriteBuffered();
  OpenPutArea();
}

}  // namespace kelcore::filesupport
