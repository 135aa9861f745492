#include <kelcore/filesupport/PlatformByteStream.h>

#include <kelcore/filesupport/BufferedByteStream.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/ByteStreamOperators.h>
#include <kelcore/filesupport/FileExceptions.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <random>
#include <string>

#if !defined(_WIN32)
#include <fcntl.h>
#include <unistd.h>
#endif

namespace kelcore::filesupport {
namespace {

namespace fs = std::filesystem;

class PlatformByteStreamTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::random_device seed;
    for (;;) {
      dir_ = fs::temp_directory_path() / ("kelcore-pstreams-" + std::to_string(seed()));
      if (fs::create_directory(dir_)) break;
    }
  }
  void TearDown() override { fs::remove_all(dir_); }

  File Make(const std::string& name, const std::string& content) {
    std::ofstream(dir_ / name, std::ios::binary) << content;
    return At(name);
  }
  File At(const std::string& name) const { return File((dir_ / name).string()); }
  std::string Content(const std::string& name) const {
    std::string content(fs::file_size(dir_ / name), '\0');
    std::ifstream(dir_ / name, std::ios::binary).read(content.data(), content.size());
    return content;
  }

  fs::path dir_;
};

TEST_F(PlatformByteStreamTest, OpeningReportsMissingFilesAndRefusesDirectories) {
  EXPECT_THROW(IPlatformByteStream(At("missing"), 0), file_not_found_exception);
  EXPECT_THROW(OPlatformByteStream(At("missing"), 0), file_not_found_exception);
  EXPECT_THROW(IPlatformByteStream(At("no/such/dir/file"), 2), file_not_found_exception);
  fs::create_directory(dir_ / "sub");
  EXPECT_THROW(IPlatformByteStream(At("sub"), 0), io_error);
  EXPECT_THROW(OPlatformByteStream(At("sub"), 0), io_error);
  EXPECT_FALSE(fs::exists(dir_ / "missing"));  // the output never creates
}

TEST_F(PlatformByteStreamTest, OutputOverwritesInPlaceAndTruncateNeverExtends) {
  OPlatformByteStream out(Make("f", "12345"), 0);
  out.Put('a');
  out.WriteBlock(reinterpret_cast<const unsigned char*>("b"), 1);
  EXPECT_EQ(out.CurPos(), 2u);
  EXPECT_EQ(Content("f"), "ab345");  // unbuffered: visible at once
  EXPECT_THROW(out.Truncate(6), eof_error);
  EXPECT_EQ(out.Length(), 5u);
  EXPECT_EQ(out.CurPos(), 2u);
  out.Truncate(3);
  EXPECT_EQ(out.CurPos(), 3u);
  out.CurPos(5);
  out.Put('z');  // past the end: the gap reads as zeros
  out.OSFlush();
  EXPECT_EQ(Content("f"), std::string("ab3\0\0z", 6));
  EXPECT_THROW(out.CurPos(1ull << 63), io_error);
}

TEST_F(PlatformByteStreamTest, InputDoesNotDetectTheOrdinaryEnd) {
  IPlatformByteStream in(Make("f", "xyz"), 0);
  EXPECT_EQ(in.Length(), 3u);
  EXPECT_EQ(in.Get(), 'x');
  unsigned char block[4] = {'-', '-', '-', '-'};
  in.ReadBlock(block, 4);  // short: only two bytes remain
  EXPECT_EQ(std::string(block, block + 4), "yz--");
  EXPECT_TRUE(in.AtTheEnd());
  in.Get();  // an unspecified byte, no error, no move
  EXPECT_EQ(in.CurPos(), 3u);
  in.CurPos(1);
  EXPECT_EQ(in.Get(), 'y');
  EXPECT_GE(in.GetPlatformHandle(), 0);
}

// Which opens may meet on one file, in either order. The pairs that may: inputs with
// inputs, and a sharing input with a sharing output.
TEST_F(PlatformByteStreamTest, SharingRulesBetweenTwoStreams) {
  enum Kind { kInput, kSharingInput, kOutput, kSharingOutput };
  const auto open = [&](Kind kind) -> std::unique_ptr<ByteStream_base> {
    const unsigned long options = kind == kSharingInput || kind == kSharingOutput ? 2 : 0;
    if (kind == kInput || kind == kSharingInput) {
      return std::make_unique<IPlatformByteStream>(At("f"), options);
    }
    return std::make_unique<OPlatformByteStream>(At("f"), options);
  };
  const bool allowed[4][4] = {
      // second: input, sharing input, output, sharing output
      {true, true, false, false},    // first: input
      {true, true, false, true},     // first: sharing input
      {false, false, false, false},  // first: output
      {false, true, false, false},   // first: sharing output
  };
  Make("f", "data");
  for (int first = kInput; first <= kSharingOutput; ++first) {
    for (int second = kInput; second <= kSharingOutput; ++second) {
      auto held = open(static_cast<Kind>(first));
      if (allowed[first][second]) {
        EXPECT_NO_THROW(open(static_cast<Kind>(second))) << first << " then " << second;
      } else {
        EXPECT_THROW(open(static_cast<Kind>(second)), io_error) << first << " then " << second;
      }
      held.reset();
      EXPECT_NO_THROW(open(static_cast<Kind>(second)));  // closing releases the file
    }
  }
}

TEST_F(PlatformByteStreamTest, InputOnAWriterSharesItsHandleAndPosition) {
  OPlatformByteStream out(Make("f", ""), 0);
  {
    IPlatformByteStream in(&out);
    EXPECT_EQ(in.GetPlatformHandle(), out.GetPlatformHandle());
    out.WriteBlock(reinterpret_cast<const unsigned char*>("abc"), 3);
    in.CurPos(1);
    EXPECT_EQ(in.Get(), 'b');
    EXPECT_EQ(out.CurPos(), 2u);
    out.Put('X');
  }
  out.Put('Y');  // the input did not close the writer's handle
  EXPECT_EQ(Content("f"), "abXY");
  EXPECT_THROW(IPlatformByteStream(nullptr), std::invalid_argument);
}

TEST_F(PlatformByteStreamTest, PathsAreHandedToTheSystemAsUtf8) {
  const std::string bytes = "caf\xC3\xA9.bin";
  Make(bytes, "\x01\x02");
  UTF16String path;
  for (const char c : dir_.string()) path.push_back(static_cast<UTF16Char>(c));
  path += u"/caf\u00e9.bin";
  IPlatformByteStream in(File(path), 0);
  EXPECT_EQ(in.Length(), 2u);
}

// The usual stack: buffered streams over platform streams.
TEST_F(PlatformByteStreamTest, BufferedStreamsOverFiles) {
  OPlatformByteStream file(Make("buffered", "old content"), 0);
  std::mt19937 random(3);
  std::vector<unsigned int> values(5000);
  for (auto& v : values) v = static_cast<unsigned int>(random());
  {
    OBufferedByteStream out(file, 4096, 512);
    out.Truncate(0);
    for (const auto v : values) out << v;
    out << std::string("tail");
  }
  IPlatformByteStream source(&file);  // the writer forbids other opens
  IBufferedByteStream in(source, 4096, 512);
  for (const auto v : values) {
    unsigned int read = 0;
    in >> read;
    ASSERT_EQ(read, v);
  }
  std::string tail;
  in >> tail;
  EXPECT_EQ(tail, "tail");
  EXPECT_THROW(in.Get(), eof_error);
}

#if !defined(_WIN32)
// A subclass that brings its own descriptor.
class AdoptingStream : public OPlatformByteStream {
 public:
  AdoptingStream(bool applySharing, const File& file, unsigned long options)
      : OPlatformByteStream(applySharing, file, options) {}
  using OPlatformByteStream::SetPlatformHandle;
};

TEST_F(PlatformByteStreamTest, SubclassSuppliesItsOwnHandle) {
  const File file = Make("f", "");
  AdoptingStream unopened(false, file, 0);
  EXPECT_THROW(unopened.Put(1), io_error);

  const int fd = ::open((dir_ / "f").c_str(), O_RDWR | O_CLOEXEC);
  ASSERT_GE(fd, 0);
  {
    IPlatformByteStream reader(file, 0);  // forbids other writers
    AdoptingStream strict(true, file, 0);
    EXPECT_THROW(strict.SetPlatformHandle(fd), io_error);
    AdoptingStream lax(false, file, 0);
    lax.SetPlatformHandle(fd);
    lax.Put('k');
  }  // `lax` closed the descriptor
  EXPECT_EQ(::fcntl(fd, F_GETFD), -1);
  EXPECT_EQ(Content("f"), "k");
}
#endif

}  // namespace
}  // namespace kelcore::filesupport
