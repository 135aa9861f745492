// Byte streams over a standard narrow iostream that the caller owns and that must outlive
// the stream.
//
// These streams raise nothing of their own: failures stay in the iostream's state. Get
// at the end returns 0xFF (the low byte of the end-of-file value) and leaves the istream
// failed. Positions are the iostream's get/put positions (absolute seeks); while the
// iostream is failed its position reads as 2^64 - 1 (tellg/tellp's -1). There is no
// OSFlush or Truncate on the output (a call is a program fault).
#pragma once

#include <istream>
#include <ostream>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API IStdByteStream : public IByteStream {
 public:
  explicit IStdByteStream(std::istream& stream);
  ~IStdByteStream() override;

  unsigned char Get() override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // Seeks to the end to measure, then back to where the get position was.
  unsigned long long Length() const override;

 private:
  std::istream& stream_;
};

class KELCORE_API OStdByteStream : public OByteStream {
 public:
  explicit OStdByteStream(std::ostream& stream);
  ~OStdByteStream() override;

  void Put(unsigned char byte) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;

 private:
  std::ostream& stream_;
};

}  // namespace kelcore::filesupport
