#include <kelcore/utility/Base64.h>

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

namespace kelcore::utility {
namespace {

UTF8String U8(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}
ByteVector Bytes(const std::string& text) {
  return ByteVector(text.begin(), text.end());
}

// RFC 4648 section 10, plus the two characters above "9" and a two-byte example.
TEST(Base64, EncodeVectors) {
  const std::pair<std::string, std::string> cases[] = {
      {"", ""},
      {"f", "Zg=="},
      {"fo", "Zm8="},
      {"foo", "Zm9v"},
      {"foob", "Zm9vYg=="},
      {"fooba", "Zm9vYmE="},
      {"foobar", "Zm9vYmFy"},
      {"Ma", "TWE="},
      {std::string("\x00\xFF\xFE", 3), "AP/+"},
  };
  for (const auto& [data, text] : cases) {
    UTF8String out = U8("left over");
    EXPECT_TRUE(EncodeBinaryDataToUTF8String(reinterpret_cast<const unsigned char*>(data.data()),
                                             static_cast<unsigned int>(data.size()), out));
    EXPECT_EQ(out, U8(text));
  }
}

TEST(Base64, EncodeRefusesTooLongOutputAndNullData) {
  const unsigned char byte = 0;
  UTF8String out = U8("left over");
  // 3221225470 bytes would need 4294967296 characters; nothing is read before refusing.
  EXPECT_FALSE(EncodeBinaryDataToUTF8String(&byte, 3221225470u, out));
  EXPECT_TRUE(out.empty());
  EXPECT_FALSE(EncodeBinaryDataToUTF8String(nullptr, 3, out));
}

// White space between characters, padding inside the text, and every way to fail.
TEST(Base64, DecodeVectors) {
  struct Case {
    std::string text;
    bool ok;
    std::string bytes;
  };
  const Case cases[] = {
      {"TW Fu\n", true, "Man"},
      {"", true, ""},
      {" \t\r\n\v\f", true, ""},
      {"Zm 9v\vYg=\f=", true, "foob"},
      {"TQ==TQ==", true, "MM"},
      {"Zg=A", true, "f"},  // "=" in the third slot ends the group
      {"Zm9vYmFy\n", true, "foobar"},
      {"TWE", false, ""},
      {"Zm9vY", false, ""},
      {"=Zg=", false, ""},
      {"Z===", false, ""},
      {"Zm9v!AAA", false, ""},
      {"Zm-_", false, ""},
      {std::string("Zm9v\0AAA", 8), false, ""},
  };
  for (const Case& c : cases) {
    ByteVector out = Bytes("left over");
    EXPECT_EQ(DecodeBinaryDataFromUTF8String(U8(c.text), out), c.ok) << c.text;
    EXPECT_EQ(out, Bytes(c.bytes)) << c.text;
  }
}

TEST(Base64, BinaryRoundTrip) {
  std::mt19937 rng(7);
  for (unsigned size = 0; size < 100; ++size) {
    std::vector<unsigned char> data(size);
    for (auto& b : data) b = static_cast<unsigned char>(rng());
    UTF8String text;
    ASSERT_TRUE(EncodeBinaryDataToUTF8String(data.data(), size, text));
    ByteVector back;
    ASSERT_TRUE(DecodeBinaryDataFromUTF8String(text, back));
    EXPECT_EQ(std::vector<unsigned char>(back.begin(), back.end()), data);
  }
}

TEST(Base64, UTF16Text) {
  EXPECT_EQ(EncodeUTF16ToAscii(UTF16String()), "");
  EXPECT_EQ(EncodeUTF16ToAscii(UTF16String{0x41}), "QQA=");              // 41 00
  EXPECT_EQ(EncodeUTF16ToAscii(UTF16String{0xE9, 0xD800}), "6QAA2A==");  // E9 00 00 D8
  EXPECT_EQ(DecodeUTF16FromAscii("6QAA2A=="), (UTF16String{0xE9, 0xD800}));
  EXPECT_EQ(DecodeUTF16FromAscii(std::string("QQA=\0QUJD", 9)),
            UTF16String{0x41});                                // up to the NUL
  EXPECT_EQ(DecodeUTF16FromAscii("QQBC"), UTF16String{0x41});  // 41 00 42: the odd byte is dropped
  EXPECT_EQ(DecodeUTF16FromAscii("QQ=="), UTF16String());
  EXPECT_EQ(DecodeUTF16FromAscii("QQA"), UTF16String());
  EXPECT_EQ(DecodeUTF16FromAscii(""), UTF16String());
}

}  // namespace
}  // namespace kelcore::utility
