// Byte streams over a std::deque<unsigned char> that the caller owns and that must outlive
// the stream.
//
// The input reads from an index that may be set anywhere without a check (eof_error at
// the next Get when it is at or past the end); bytes appended to the deque while it is
// read become readable. The output only ever appends: setting its position is ignored
// and its position is always the deque's size.
#pragma once

#include <deque>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API IDequeByteStream : public IByteStream {
 public:
  explicit IDequeByteStream(std::deque<unsigned char>& bytes);
  ~IDequeByteStream() override;

  unsigned char Get() override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // The deque's current size.
  unsigned long long Length() const override;

 private:
  std::deque<unsigned char>& bytes_;
  unsigned long long index_ = 0;
};

class KELCORE_API ODequeByteStream : public OByteStream {
 public:
  explicit ODequeByteStream(std::deque<unsigned char>& bytes);
  ~ODequeByteStream() override;

  // Appends at the back, always.
  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  // Ignored: the output is append-only.
  void CurPos(unsigned long long pos) override;
  // The deque's size.
  unsigned long long CurPos() const override;

 private:
  std::deque<unsigned char>& bytes_;
};

}  // namespace kelcore::filesupport
