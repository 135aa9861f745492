#include <kelcore/filesupport/ByteStreamOperators.h>

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>
#include <stdexcept>

namespace kelcore::filesupport {
namespace detail {

// Moves bytes through a stream's get or put area where it has one, and through the virtual
// Get/Put for every byte outside it: the same effect as one Get/Put per byte.
class StreamAreas {
 public:
  static std::size_t Readable(const IByteStream& in) {
    return static_cast<std::size_t>(in.egptr_ - in.gptr_);
  }
  static std::size_t Writable(const OByteStream& out) {
    return static_cast<std::size_t>(out.epptr_ - out.pptr_);
  }

  static unsigned char Get(IByteStream& in) {
    return in.gptr_ != in.egptr_ ? *in.gptr_++ : in.Get();
  }
  static void Put(OByteStream& out, unsigned char byte) {
    if (out.pptr_ != out.epptr_) {
      *out.pptr_++ = byte;
    } else {
      out.Put(byte);
    }
  }

  // Stores `count` bytes. The common case, all of them in the area, stays small enough to
  // inline; the rest is out of line.
  static void Put(OByteStream& out, const unsigned char* src, std::size_t count) {
    if (Writable(out) >= count) {
      if (count != 0) std::memcpy(out.pptr_, src, count);
      out.pptr_ += count;
    } else {
      PutAcrossArea(out, src, count);
    }
  }

  [[gnu::noinline]] static void GetAcrossArea(IByteStream& in, unsigned char* dst,
                                              std::size_t count) {
    while (count != 0) {
      const std::size_t n = std::min(Readable(in), count);
      if (n == 0) {
        *dst++ = in.Get();
        --count;
        continue;
      }
      std::memcpy(dst, in.gptr_, n);
      in.gptr_ += n;
      dst += n;
      count -= n;
    }
  }

  [[gnu::noinline]] static void PutAcrossArea(OByteStream& out, const unsigned char* src,
                                              std::size_t count) {
    while (count != 0) {
      const std::size_t n = std::min(Writable(out), count);
      if (n == 0) {
        out.Put(*src++);
        --count;
        continue;
      }
      std::memcpy(out.pptr_, src, n);
      out.pptr_ += n;
      src += n;
      count -= n;
    }
  }

  // Appends up to `count` bytes of the get area to `text` (not beyond its max_size) and
  // returns how many; 0 when the area is empty or the text is full.
  template <typename Text>
  static std::size_t AppendFromArea(IByteStream& in, Text& text, std::uint64_t count) {
    const std::size_t n = static_cast<std::size_t>(
        std::min<std::uint64_t>({Readable(in), count, text.max_size() - text.size()}));
    if (n != 0) {
      text.append(reinterpret_cast<const typename Text::value_type*>(in.gptr_), n);
      in.gptr_ += n;
    }
    return n;
  }

  // Moves up to `count` bytes from the get area of `in` to the put area of `out`; returns
  // how many.
  static std::uint64_t CopyBetweenAreas(IByteStream& in, OByteStream& out, std::uint64_t count) {
    const std::size_t n =
        static_cast<std::size_t>(std::min<std::uint64_t>({Readable(in), Writable(out), count}));
    if (n != 0) {
      std::memcpy(out.pptr_, in.gptr_, n);
      in.gptr_ += n;
      out.pptr_ += n;
    }
    return n;
  }
};

namespace {

void CheckFieldWidth(std::size_t width) {
  if (width == 0 || width > sizeof(std::uint64_t)) {
    throw std::invalid_argument("byte stream field: the width must be in [1, 8]");
  }
}

}  // namespace

std::uint64_t GetFieldAcrossArea(IByteStream& in, std::size_t width) {
  CheckFieldWidth(width);
  unsigned char bytes[sizeof(std::uint64_t)];
  StreamAreas::GetAcrossArea(in, bytes, width);
  std::uint64_t field = 0;
  for (std::size_t i = 0; i < width; ++i) field = field << 8 | bytes[i];
  return field;
}

void PutFieldAcrossArea(OByteStream& out, std::uint64_t field, std::size_t width) {
  CheckFieldWidth(width);
  unsigned char bytes[sizeof(std::uint64_t)];
  for (std::size_t i = width; i-- != 0; field >>= 8) bytes[i] = static_cast<unsigned char>(field);
  StreamAreas::PutAcrossArea(out, bytes, width);
}

}  // namespace detail

namespace {

using detail::StreamAreas;

// A corrupt length may ask for more than a string can hold.
template <typename Text>
void AppendUnit(Text& text, typename Text::value_type unit) {
  if (text.size() == text.max_size()) throw std::length_error("string too long");
  text.push_back(unit);
}

template <typename Text>
void PutText(OByteStream& out, const Text& text) {
  detail::PutField<8>(out, text.size());
  StreamAreas::Put(out, reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

template <typename Text>
void GetText(IByteStream& in, Text& text) {
  text.clear();
  std::uint64_t remaining = detail::GetField<8>(in);
  while (remaining != 0) {
    const std::size_t taken = StreamAreas::AppendFromArea(in, text, remaining);
    if (taken != 0) {
      remaining -= taken;
    } else {
      AppendUnit(text, static_cast<typename Text::value_type>(StreamAreas::Get(in)));
      --remaining;
    }
  }
}

template <typename Float>
void PutFloat(OByteStream& out, Float value) {
  // 36 significant digits in general notation need at most 1 + 36 + 1 + 6 characters
  // ("-d.ddd...e+dddd"); room to spare.
  char text[64];
  const auto result =
      std::to_chars(text, text + sizeof text, value, std::chars_format::general, 36);
  const auto length = static_cast<std::size_t>(result.ptr - text);
  detail::PutField<8>(out, length);
  StreamAreas::Put(out, reinterpret_cast<const unsigned char*>(text), length);
}

bool IsClassicSpace(char c) {
  return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

// Reads the text as the standard extractor would: leading white space and a '+' are
// accepted, trailing characters are ignored.
template <typename Float>
void GetFloat(IByteStream& in, Float& value) {
  std::string text;
  GetText(in, text);
  const char* first = text.data();
  const char* const last = first + text.size();
  while (first != last && IsClassicSpace(*first)) ++first;
  if (first != last && *first == '+' && last - first > 1 && first[1] != '-') ++first;
  Float parsed{};
  const auto result = std::from_chars(first, last, parsed, std::chars_format::general);
  if (result.ec == std::errc{}) value = parsed;
}

}  // namespace

OByteStream& operator<<(OByteStream& out, const std::string& value) {
  PutText(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, const UTF8String& value) {
  PutText(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, const UTF16String& value) {
  detail::PutField<8>(out, value.size());
  for (const UTF16Char unit : value) detail::PutField<2>(out, static_cast<std::uint16_t>(unit));
  return out;
}
OByteStream& operator<<(OByteStream& out, float value) {
  PutFloat(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, double value) {
  PutFloat(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, long double value) {
  PutFloat(out, value);
  return out;
}

IByteStream& operator>>(IByteStream& in, std::string& value) {
  GetText(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, UTF8String& value) {
  GetText(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, UTF16String& value) {
  value.clear();
  const std::uint64_t length = detail::GetField<8>(in);
  for (std::uint64_t i = 0; i < length; ++i) {
    AppendUnit(value, static_cast<UTF16Char>(detail::GetField<2>(in)));
  }
  return in;
}
IByteStream& operator>>(IByteStream& in, float& value) {
  GetFloat(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, double& value) {
  GetFloat(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, long double& value) {
  GetFloat(in, value);
  return in;
}

OByteStream& operator<<(OByteStream& out, IByteStream& in) {
  const unsigned long long length = in.Length();
  if (length == 0) {
    // Only the input's end stops the copy; a full output still raises.
    for (;;) {
      if (StreamAreas::CopyBetweenAreas(in, out, std::numeric_limits<std::uint64_t>::max()) != 0) {
        continue;
      }
      unsigned char byte;
      try {
        byte = StreamAreas::Get(in);
      } catch (const eof_error&) {
        return out;
      }
      StreamAreas::Put(out, byte);
    }
  }
  for (unsigned long long remaining = length; remaining != 0;) {
    const std::uint64_t moved = StreamAreas::CopyBetweenAreas(in, out, remaining);
    if (moved != 0) {
      remaining -= moved;
    } else {
      StreamAreas::Put(out, StreamAreas::Get(in));
      --remaining;
    }
  }
  return out;
}

}  // namespace kelcore::filesupport
