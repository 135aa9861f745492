// Byte streams over a fixed block of memory that the caller owns.
//
// Neither stream owns or copies the memory: it must outlive the stream. Positions may be
// set anywhere, even past the end, without a check; reading or writing there raises
// eof_error. A buffer of size 0 raises eof_error on the first Get or Put. ReadBlock and
// WriteBlock copy with memcpy but behave exactly as one Get/Put per byte: bytes up to
// the end are transferred, then eof_error is raised.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API IBufferByteStream : public IByteStream {
 public:
  // `data` may be null only when `size` is 0.
  IBufferByteStream(const unsigned char* data, unsigned long long size);
  ~IBufferByteStream() override;

  unsigned char Get() override;
  void ReadBlock(unsigned char* dst, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // The size given at construction.
  unsigned long long Length() const override;

 private:
  const unsigned char* data_;
  unsigned long long size_;
  unsigned long long position_ = 0;
};

class KELCORE_API OBufferByteStream : public OByteStream {
 public:
  // `data` may be null only when `capacity` is 0.
  OBufferByteStream(unsigned char* data, unsigned long long capacity);
  ~OBufferByteStream() override;

  // Overwrites the byte at the position; eof_error when the position is at or past the
  // capacity (the buffer is full).
  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  // Moves the position; a position beyond everything written (even beyond the capacity)
  // raises Count() without writing anything.
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;

  // The capacity given at construction.
  virtual unsigned long long Length() const;
  // The high-water mark: the highest position ever reached by a write or a seek, i.e.
  // how many bytes of the buffer a caller must keep.
  unsigned long long Count() const { return count_; }

 private:
  void RaiseCount();

  unsigned char* data_;
  unsigned long long capacity_;
  unsigned long long position_ = 0;
  unsigned long long count_ = 0;
};

}  // namespace kelcore::filesupport
