#include <kelcore/filesupport/RLEByteStream.h>

#include <algorithm>
#include <bit>
#include <cstring>

#include <kelcore/filesupport/ByteStreamExceptions.h>

namespace kelcore::filesupport {
namespace {

// Word-at-a-time scanning on little-endian machines (the lowest byte of a loaded word is
// the first in memory); byte loops elsewhere and for the tails.
constexpr bool kScanWords = std::endian::native == std::endian::little;

std::uint64_t Load64(const unsigned char* p) {
  std::uint64_t word;
  std::memcpy(&word, p, sizeof word);
  return word;
}

// The index of the lowest zero byte of `x`, 8 when none is. The borrow of the zero-byte
// test only moves upwards, so the lowest flag is exact.
int FirstZeroByte(std::uint64_t x) {
  const std::uint64_t flags = (x - 0x0101010101010101u) & ~x & 0x8080808080808080u;
  return flags == 0 ? 8 : std::countr_zero(flags) / 8;
}

// The first byte in [p, stop) that differs from `value`, or stop.
const unsigned char* EndOfRun(const unsigned char* p, const unsigned char* stop,
                              unsigned char value) {
  if constexpr (kScanWords) {
    const std::uint64_t pattern = 0x0101010101010101u * value;
    for (; stop - p >= 8; p += 8) {
      const std::uint64_t differences = Load64(p) ^ pattern;
      if (differences != 0) return p + std::countr_zero(differences) / 8;
    }
  }
  while (p != stop && *p == value) ++p;
  return p;
}

// The first byte in [p, stop) that completes three equal bytes in a row, `before` and
// `last` being the two bytes that precede p; stop when there is none.
const unsigned char* EndOfLiteral(const unsigned char* p, const unsigned char* stop,
                                  unsigned char before, unsigned char last) {
  const unsigned char* const start = p;
  for (int i = 0; i < 2 && p != stop; ++i) {
    if (*p == last && *p == before) return p;
    before = last;
    last = *p++;
  }
  if constexpr (kScanWords) {
    // Here p - 2 >= start: the triples ending at p .. p + 7 lie in [p - 2, p + 8).
    for (; stop - p >= 8; p += 8) {
      const std::uint64_t a = Load64(p - 2);
      const std::uint64_t b = Load64(p - 1);
      const std::uint64_t c = Load64(p);
      const int triple = FirstZeroByte((a ^ b) | (b ^ c));
      if (triple < 8) return p + triple;
    }
    if (p - start >= 2) {
      before = p[-2];
      last = p[-1];
    }
  }
  while (p != stop && !(*p == last && *p == before)) {
    before = last;
    last = *p++;
  }
  return p;
}

}  // namespace

ORLEByteStream::ORLEByteStream(OByteStream& target) : target_(target) {}

ORLEByteStream::~ORLEByteStream() = default;

// One step of the packet state machine; Put and WriteBlock both go through it, so the
// packets never depend on how the bytes were handed in.
inline void ORLEByteStream::Append(unsigned char byte) {
  if (count_ == 0) {
    pending_[0] = byte;
    count_ = 1;
    run_ = true;
    return;
  }
  if (run_ && byte != pending_[0]) {
    if (count_ > 1) {
      WritePacket();
      pending_[0] = byte;
    } else {
      run_ = false;  // a single pending byte followed by a different one: a literal
    }
  }
  if (!run_) {
    if (count_ >= 3 && pending_[count_ - 1] == byte && pending_[count_ - 2] == byte) {
      // Three equal bytes in a row: the two pending ones leave the literal for a run.
      count_ -= 2;
      WritePacket();
      pending_[0] = byte;
      count_ = 3;
      run_ = true;
      return;
    }
    pending_[count_] = byte;
  }
  if (++count_ == kMaxPacket) WritePacket();
}

void ORLEByteStream::Put(unsigned char byte) {
  Append(byte);
}

void ORLEByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  const unsigned char* const end = src + count;
  while (src != end) {
    // Inside a run, equal bytes only extend it: take them all at once.
    if (run_ && count_ != 0 && *src == pending_[0]) {
      const auto room = static_cast<std::ptrdiff_t>(kMaxPacket - count_);
      const unsigned char* const p = EndOfRun(src, src + std::min(room, end - src), pending_[0]);
      count_ += static_cast<std::uint32_t>(p - src);
      src = p;
      if (count_ == kMaxPacket) WritePacket();
      continue;
    }
    // Inside a literal (which always holds two different bytes or more), bytes join it
    // until the third of three equal bytes in a row: copy up to there at once.
    if (!run_ && count_ >= 2) {
      const auto room = static_cast<std::ptrdiff_t>(kMaxPacket - count_);
      const unsigned char* const stop = src + std::min(room, end - src);
      const unsigned char* const p =
          EndOfLiteral(src, stop, pending_[count_ - 2], pending_[count_ - 1]);
      std::memcpy(pending_ + count_, src, static_cast<std::size_t>(p - src));
      count_ += static_cast<std::uint32_t>(p - src);
      src = p;
      if (count_ == kMaxPacket) {
        WritePacket();
        continue;
      }
      if (src == end) break;
    }
    Append(*src++);
  }
}

void ORLEByteStream::CurPos(unsigned long long) {
  throw byte_stream_exception();
}

unsigned long long ORLEByteStream::CurPos() const {
  throw byte_stream_exception();
}

void ORLEByteStream::Flush() {
  if (count_ > 0) WritePacket();
}

void ORLEByteStream::WritePacket() {
  if (count_ == 0) return;
  // Emptied before writing, so that a target that raises leaves a consistent (if
  // shortened) state behind.
  const std::uint32_t count = count_;
  count_ = 0;
  const auto control = static_cast<unsigned char>(count - 1);
  if (run_ && control != 0) {
    target_.Put(static_cast<unsigned char>(-control));
    target_.WriteBlock(pending_, 1);
  } else {
    target_.Put(control);
    target_.WriteBlock(pending_, count);
  }
}

IRLEByteStream::IRLEByteStream(IByteStream& source) : source_(source) {}

IRLEByteStream::~IRLEByteStream() = default;

void IRLEByteStream::ReadControl() {
  unsigned char control;
  do {
    control = source_.Get();
  } while (control == 0x80);
  if (control < 0x80) {
    literal_ = control + 1;
  } else {
    repeated_ = source_.Get();
    repeat_ = 1 - static_cast<signed char>(control);
  }
}

unsigned char IRLEByteStream::Get() {
  if (literal_ == 0 && repeat_ == 0) ReadControl();
  if (literal_ > 0) {
    const unsigned char byte = source_.Get();
    --literal_;
    return byte;
  }
  --repeat_;
  return repeated_;
}

void IRLEByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  while (count > 0) {
    if (literal_ == 0 && repeat_ == 0) ReadControl();
    if (literal_ > 0) {
      const auto n = static_cast<std::int32_t>(std::min<unsigned long>(literal_, count));
      source_.ReadBlock(dst, static_cast<unsigned long>(n));
      literal_ -= n;
      dst += n;
      count -= static_cast<unsigned long>(n);
    } else {
      const auto n = static_cast<std::int32_t>(std::min<unsigned long>(repeat_, count));
      std::memset(dst, repeated_, static_cast<std::size_t>(n));
      repeat_ -= n;
      dst += n;
      count -= static_cast<unsigned long>(n);
    }
  }
}

void IRLEByteStream::CurPos(unsigned long long) {
  throw byte_stream_exception();
}

unsigned long long IRLEByteStream::CurPos() const {
  throw byte_stream_exception();
}

unsigned long long IRLEByteStream::Length() const {
  return 0;
}

}  // namespace kelcore::filesupport
