// An output filter that passes bytes through to another output while computing their
// CRC-32: the IEEE 802.3 CRC (reflected polynomial 0xEDB88320, initial register
// 0xFFFFFFFF, final XOR 0xFFFFFFFF), so "123456789" gives 0xCBF43926.
//
// The filter does not own its target, which must outlive it. Positioning is forwarded to
// the target and does not touch the CRC: bytes rewritten after a seek are added to the
// CRC again, never replaced. The filter raises nothing of its own; errors of the target
// pass through (a byte that the target refused has already been added to the CRC).
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API OCRCByteStream : public OByteStream {
 public:
  explicit OCRCByteStream(OByteStream& target);
  ~OCRCByteStream() override;

  void Put(unsigned char byte) override;
  // Adds the block to the CRC (with a fast block algorithm), then hands it to the target
  // in one WriteBlock.
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;

  // The CRC of everything written so far (0 when nothing was); does not reset it.
  unsigned long Value() const;

 private:
  struct State;
  std::unique_ptr<State> state_;
  OByteStream& target_;
};

}  // namespace kelcore::filesupport
