#include <kelcore/filesupport/ByteStreamOperators.h>

#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/StringByteStream.h>

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <functional>
#include <limits>
#include <random>
#include <string>

namespace kelcore::filesupport {
namespace {

std::string Serialise(const std::function<void(OByteStream&)>& write) {
  std::string bytes;
  OStringByteStream out(bytes);
  write(out);
  return bytes;
}

std::string Hex(const std::string& bytes) {
  static const char kDigits[] = "0123456789ABCDEF";
  std::string text;
  for (const char c : bytes) {
    const auto b = static_cast<unsigned char>(c);
    if (!text.empty()) text += ' ';
    text += kDigits[b >> 4];
    text += kDigits[b & 15];
  }
  return text;
}

// The wire layout, byte for byte. Values from the stream format's own examples plus the
// extremes of every field.
TEST(ByteStreamOperators, LayoutVectors) {
  const std::pair<std::function<void(OByteStream&)>, std::string> cases[] = {
      {[](OByteStream& o) { o << 'A'; }, "41"},
      {[](OByteStream& o) { o << static_cast<signed char>(-1); }, "FF"},
      {[](OByteStream& o) { o << true << false; }, "01 00"},
      {[](OByteStream& o) { o << boost::logic::tribool(boost::logic::indeterminate); }, "02"},
      {[](OByteStream& o) { o << static_cast<short>(-2); }, "FF FE"},
      {[](OByteStream& o) { o << static_cast<unsigned short>(0xABCD); }, "AB CD"},
      {[](OByteStream& o) { o << u'\u20AC'; }, "20 AC"},
      {[](OByteStream& o) { o << 0x01020304u; }, "01 02 03 04"},
      {[](OByteStream& o) { o << -2L; }, "FF FF FF FE"},
      {[](OByteStream& o) { o << static_cast<long>(INT32_MIN); }, "80 00 00 00"},
      {[](OByteStream& o) { o << 0xFFFFFFFFUL; }, "FF FF FF FF"},
      {[](OByteStream& o) { o << 1ULL; }, "00 00 00 00 00 00 00 01"},
      {[](OByteStream& o) { o << -1LL; }, "FF FF FF FF FF FF FF FF"},
      {[](OByteStream& o) { o << std::string(); }, "00 00 00 00 00 00 00 00"},
      {[](OByteStream& o) { o << std::string("\xC3\xA9", 2); }, "00 00 00 00 00 00 00 02 C3 A9"},
      {[](OByteStream& o) { o << UTF8String(3, 0xFF); }, "00 00 00 00 00 00 00 03 FF FF FF"},
      {[](OByteStream& o) { o << UTF16String(u"A"); }, "00 00 00 00 00 00 00 01 00 41"},
      {[](OByteStream& o) { o << UTF16String(u"\xD800"); }, "00 00 00 00 00 00 00 01 D8 00"},
      {[](OByteStream& o) { o << 0.5; }, "00 00 00 00 00 00 00 03 30 2E 35"},
      {[](OByteStream& o) { o << -0.0f; }, "00 00 00 00 00 00 00 02 2D 30"},
      {[](OByteStream& o) { o << 0.25L; }, "00 00 00 00 00 00 00 04 30 2E 32 35"},
  };
  for (const auto& [write, expected] : cases) EXPECT_EQ(Hex(Serialise(write)), expected);
}

TEST(ByteStreamOperators, DoubleTextHas36SignificantDigits) {
  EXPECT_EQ(Serialise([](OByteStream& o) { o << 0.1; }).substr(8),
            "0.100000000000000005551115123125782702");
  EXPECT_EQ(Serialise([](OByteStream& o) { o << 1e100; }).substr(8),
            "1.00000000000000001590289110975991805e+100");
}

template <typename T>
T RoundTrip(const T& value, T initial = T{}) {
  std::string bytes = Serialise([&](OByteStream& o) { o << value; });
  IStringByteStream in(bytes);
  T result = initial;
  in >> result;
  EXPECT_EQ(in.CurPos(), bytes.size());
  return result;
}

TEST(ByteStreamOperators, IntegersAndStringsRoundTrip) {
  EXPECT_EQ(RoundTrip(static_cast<short>(INT16_MIN)), INT16_MIN);
  EXPECT_EQ(RoundTrip(static_cast<long>(INT32_MIN)), INT32_MIN);
  EXPECT_EQ(RoundTrip(static_cast<long>(INT32_MAX)), INT32_MAX);
  EXPECT_EQ(RoundTrip(0xFFFFFFFFUL), 0xFFFFFFFFUL);
  EXPECT_EQ(RoundTrip(std::numeric_limits<long long>::min()),
            std::numeric_limits<long long>::min());
  EXPECT_EQ(RoundTrip(std::numeric_limits<unsigned long long>::max()),
            std::numeric_limits<unsigned long long>::max());
  EXPECT_EQ(RoundTrip(std::string("a\0b", 3), std::string("old")), std::string("a\0b", 3));
  EXPECT_EQ(RoundTrip(std::string(), std::string("old")), "");
  EXPECT_EQ(RoundTrip(UTF16String(u"\xDC00x\xFFFF")), UTF16String(u"\xDC00x\xFFFF"));
}

TEST(ByteStreamOperators, BoolAndTriboolReadAnyByte) {
  std::string bytes("\x07\x00\x01\x02\x09", 5);
  IStringByteStream in(bytes);
  bool flag = false;
  in >> flag;
  EXPECT_TRUE(flag);
  boost::logic::tribool states[4];
  for (auto& state : states) in >> state;
  EXPECT_TRUE(!states[0]);
  EXPECT_TRUE(states[1]);
  EXPECT_TRUE(boost::logic::indeterminate(states[2]));
  EXPECT_TRUE(boost::logic::indeterminate(states[3]));
}

// Every bit of doubles and floats survives, including the extremes, subnormals, signed
// zero and the non-finite values.
TEST(ByteStreamOperators, FloatingPointRestoresEveryBit) {
  std::mt19937_64 random(20261122);
  for (int i = 0; i < 2000; ++i) {
    const double d = std::bit_cast<double>(random());
    if (std::isnan(d)) continue;
    EXPECT_EQ(std::bit_cast<std::uint64_t>(RoundTrip(d)), std::bit_cast<std::uint64_t>(d));
    const float f = std::bit_cast<float>(static_cast<std::uint32_t>(random()));
    if (std::isnan(f)) continue;
    EXPECT_EQ(std::bit_cast<std::uint32_t>(RoundTrip(f)), std::bit_cast<std::uint32_t>(f));
  }
  for (const double d :
       {0.1, -0.0, std::numeric_limits<double>::denorm_min(), std::numeric_limits<double>::max(),
        std::numeric_limits<double>::lowest(), std::numeric_limits<double>::infinity(),
        -std::numeric_limits<double>::infinity()}) {
    EXPECT_EQ(std::bit_cast<std::uint64_t>(RoundTrip(d)), std::bit_cast<std::uint64_t>(d));
  }
  EXPECT_TRUE(std::isnan(RoundTrip(std::numeric_limits<double>::quiet_NaN())));
  // A double's text read as long double gives the same value, and back.
  std::string bytes = Serialise([](OByteStream& o) { o << 0.1; });
  IStringByteStream in(bytes);
  long double wide = 0;
  in >> wide;
  EXPECT_EQ(wide, static_cast<long double>(0.1));
  EXPECT_EQ(static_cast<double>(RoundTrip(static_cast<long double>(0.1))), 0.1);
}

TEST(ByteStreamOperators, UnparsableNumberTextKeepsTheTarget) {
  for (const std::string text : {"", "abc", "1e999999", "--1", "+-1"}) {
    std::string bytes = Serialise([&](OByteStream& o) { o << text; });
    IStringByteStream in(bytes);
    double value = 42;
    in >> value;
    EXPECT_EQ(value, 42) << text;
  }
  for (const auto& item :
       {std::pair<std::string, double>{" \t+2.5", 2.5}, {"-3x", -3.0}, {"1E2", 100.0}}) {
    std::string bytes = Serialise([&](OByteStream& o) { o << item.first; });
    IStringByteStream in(bytes);
    double value = 0;
    in >> value;
    EXPECT_EQ(value, item.second) << item.first;
  }
}

TEST(ByteStreamOperators, LongValuesOutsideTheirFieldAreRefused) {
  if constexpr (sizeof(long) > 4) {
    std::string bytes;
    OStringByteStream out(bytes);
    EXPECT_THROW(out << (static_cast<long>(INT32_MAX) + 1), value_width_error);
    EXPECT_THROW(out << (static_cast<long>(INT32_MIN) - 1), value_width_error);
    EXPECT_THROW(out << 0x100000000UL, value_width_error);
    EXPECT_TRUE(bytes.empty());
    try {
      out << 0x100000000UL;
    } catch (const byte_stream_exception& error) {
      EXPECT_NE(std::string(error.what()).find("fixed-width"), std::string::npos);
    }
  }
}

// Every strict prefix of a record fails with eof_error, never a read out of bounds.
TEST(ByteStreamOperators, TruncatedRecordsRaiseEof) {
  const std::string record = Serialise([](OByteStream& o) {
    o << 7ULL << UTF16String(u"wide") << std::string("narrow") << 2.75 << -5L;
  });
  for (std::size_t cut = 0; cut < record.size(); ++cut) {
    std::string prefix = record.substr(0, cut);
    IStringByteStream in(prefix);
    unsigned long long a;
    UTF16String b;
    std::string c;
    double d;
    long e;
    EXPECT_THROW(in >> a >> b >> c >> d >> e, eof_error) << cut;
  }
}

// Random bytes through every extractor: each read either succeeds or raises eof_error.
TEST(ByteStreamOperators, RandomBytesNeverBreakTheExtractors) {
  std::mt19937 random(7);
  for (int round = 0; round < 300; ++round) {
    std::vector<unsigned char> bytes(random() % 64);
    for (auto& b : bytes) b = static_cast<unsigned char>(random());
    // Keep string lengths plausible now and then so that the text paths get exercised.
    if (bytes.size() > 8 && round % 2 == 0) std::fill_n(bytes.begin(), 7, 0);
    IBufferByteStream in(bytes.data(), bytes.size());
    try {
      for (;;) {
        switch (random() % 6) {
          case 0: {
            std::string s;
            in >> s;
            break;
          }
          case 1: {
            UTF16String s;
            in >> s;
            break;
          }
          case 2: {
            double d;
            in >> d;
            break;
          }
          case 3: {
            long v;
            in >> v;
            break;
          }
          case 4: {
            boost::logic::tribool t;
            in >> t;
            break;
          }
          default: {
            short v;
            in >> v;
            break;
          }
        }
      }
    } catch (const eof_error&) {
    }
  }
}

TEST(ByteStreamOperators, CopyOfUnknownLengthStopsAtTheInputsEnd) {
  // An input of unknown length: a buffer stream that hides its length.
  class UnknownLength : public IBufferByteStream {
   public:
    using IBufferByteStream::IBufferByteStream;
    unsigned long long Length() const override { return 0; }
  };
  const unsigned char data[] = {1, 2, 3};
  UnknownLength in(data, sizeof data);
  std::string bytes;
  OStringByteStream out(bytes);
  out << in;
  EXPECT_EQ(bytes, "\x01\x02\x03");

  // A full output still raises, even when the input's end is unknown.
  UnknownLength again(data, sizeof data);
  unsigned char small[2];
  OBufferByteStream tiny(small, sizeof small);
  EXPECT_THROW(tiny << again, eof_error);
}

TEST(ByteStreamOperators, CopyOfKnownLengthFromTheMiddleRaisesEof) {
  const unsigned char data[] = {1, 2, 3, 4};
  IBufferByteStream in(data, sizeof data);
  std::string bytes;
  OStringByteStream out(bytes);
  out << in;
  EXPECT_EQ(bytes.size(), 4u);
  in.CurPos(1);
  EXPECT_THROW(out << in, eof_error);
  EXPECT_EQ(bytes.size(), 7u);
}

}  // namespace
}  // namespace kelcore::filesupport
