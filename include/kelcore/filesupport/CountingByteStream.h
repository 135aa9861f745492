// An output stream that stores nothing and measures how many bytes a serialisation would
// produce, seeks and overwrites included. It raises nothing.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API OCountingByteStream : public OByteStream {
 public:
  OCountingByteStream();
  ~OCountingByteStream() override;

  // Discards the byte; the position moves on by one.
  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  // Sets the position only; the count changes with the next write.
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;

  // The highest position any write has reached: the size a real output would have after
  // the same calls.
  unsigned long long Count() const { return count_; }

 private:
  unsigned long long count_ = 0;
  unsigned long long position_ = 0;
};

}  // namespace kelcore::filesupport
