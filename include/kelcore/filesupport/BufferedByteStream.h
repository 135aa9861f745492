// Buffered byte streams: a caller-sized memory buffer in front of another stream, so that
// byte-wise traffic (Get/Put, the typed operators) reaches that stream as large blocks.
// The usual stack is a buffered stream over a platform file stream.
//
// Neither stream owns the stream it wraps; it must outlive the buffered stream. Errors of
// the wrapped stream pass through unchanged. Both expose their buffer as a get/put area
// (ByteStream.h), so the typed operators cost no virtual call per byte; a subclass that
// overrides Get, Put or FillBuffer does not get this shortcut and sees every call.
//
// Sizes: the buffer size must be at least 1 and at most 2^32 - 1. For the input, the
// alignment must lie in [1, buffer size]; the output stores its alignment but does not use
// it. Other values raise std::invalid_argument.
//
// Single-threaded, like every stream.
#pragma once

#include <cstdint>
#include <memory>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

// Reads through a window of the source. The source's Length() is taken once, at
// construction: bytes the source gains later cannot be read, and a source of unknown
// length (0) reads as empty.
//
// Get raises eof_error at or past that length. CurPos(pos) accepts any pos up to the length
// (equal included) and raises eof_error beyond it; it does no I/O.
//
// ReadBlock(dst, n): for n <= buffer size - alignment the bytes come through the buffer and
// no end check is made: bytes beyond the source's length are left unspecified in dst (no
// error, and never read from outside the buffer), and the position still moves by n.
// Larger blocks bypass the buffer: the source is positioned and read directly (its own
// end handling applies), and the buffer keeps what it held.
//
// Refills (FillBuffer) start on a multiple of the alignment, keep one alignment unit before
// the position when there is room (so short backward steps do not reload), and reuse the
// bytes that the old and new windows share instead of reading them again.
class KELCORE_API IBufferedByteStream : public IByteStream {
 public:
  IBufferedByteStream(IByteStream& source, unsigned long bufferSize, unsigned long alignment);
  ~IBufferedByteStream() override;

  unsigned char Get() override;
  void ReadBlock(unsigned char* dst, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // The source's length at construction.
  unsigned long long Length() const override;

 protected:
  // Makes sure the buffer holds the bytes [pos, pos + count) as far as they lie before the
  // source's length, with pos the current position (the window is chosen around `pos`).
  // count must not exceed buffer size - alignment when it is above 1.
  virtual void FillBuffer(unsigned long long pos, unsigned long count);

 private:
  void SyncFromGetArea();
  void OpenGetArea();

  IByteStream& source_;
  std::uint64_t position_ = 0;
  std::unique_ptr<unsigned char[]> buffer_;
  std::uint32_t bufferSize_;
  std::uint32_t alignment_;
  std::uint64_t bufferOffset_ = 0;
  std::uint32_t validBytes_ = 0;
  std::uint64_t sourceLength_;
};

// Collects writes in the buffer and hands them to the target as one positioned WriteBlock.
//
// The buffer covers [offset, offset + buffered count). Put/WriteBlock flush first when the
// bytes would not fit; a block larger than the buffer is written straight to the target
// (positioned there). CurPos(pos) inside the buffered range, both ends included, only moves
// the position; anywhere else it flushes first. Data reaches the target only at Flush,
// OSFlush, Truncate, a CurPos outside the buffered range, a write that does not fit, and
// destruction.
//
// Writing into the buffered range overwrites. If an error of the target interrupts a
// flush, the bytes stay buffered and the next flush (at the latest, destruction) tries
// again.
class KELCORE_API OBufferedByteStream : public OByteStream {
 public:
  OBufferedByteStream(OByteStream& target, unsigned long bufferSize, unsigned long alignment);
  // Writes the buffered bytes as Flush() does. An error of the target passes to the caller
  // (see ByteStream.h on throwing destructors); call Flush() first to handle it earlier.
  ~OBufferedByteStream() override;

  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // Flush(), then the target's OSFlush().
  void OSFlush() override;
  // Flush(), then the target's Truncate(length).
  void Truncate(unsigned long long length) override;

  // When bytes are buffered: positions the target at the buffer's offset, writes them with
  // one WriteBlock and empties the buffer. The position is unchanged.
  virtual void Flush();

 private:
  void SyncFromPutArea();
  void OpenPutArea();
  void WriteBuffered();
  void FlushAndSync();
  void Store(const unsigned char* src, unsigned long count);

  OByteStream& target_;
  std::uint64_t position_ = 0;
  std::unique_ptr<unsigned char[]> buffer_;
  std::uint32_t bufferSize_;
  std::uint32_t alignment_;
  std::uint64_t bufferOffset_ = 0;
  std::uint32_t bufferedCount_ = 0;
};

}  // namespace kelcore::filesupport
