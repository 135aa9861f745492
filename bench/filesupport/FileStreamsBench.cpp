// Typed values through buffered file streams, against stdio's byte-at-a-time macros.
//
// write_u32_256mib: 2^26 unsigned ints (256 MiB) written one at a time with operator<<
// through an OBufferedByteStream (64 KiB buffer, 4 KiB alignment) over an
// OPlatformByteStream (kelcore), against putc_unlocked of the same four big-endian bytes
// on a FILE* with stdio's default buffer. Each iteration opens the file, cuts it to zero
// length, writes everything and closes it; nothing is synced to the disk.
// read_u32_256mib: the same file read back value by value with operator>> through an
// IBufferedByteStream over an IPlatformByteStream, against four getc_unlocked per value.
// The file lives in $TMPDIR (else /tmp) and is removed at exit.
#include <kelcore/filesupport/BufferedByteStream.h>
#include <kelcore/filesupport/ByteStreamOperators.h>
#include <kelcore/filesupport/PlatformByteStream.h>

#include <benchmark/benchmark.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

namespace {

using namespace kelcore::filesupport;

constexpr std::uint32_t kValues = 1u << 26;
constexpr std::int64_t kBytes = std::int64_t{kValues} * 4;
constexpr unsigned long kBufferSize = 1ul << 16;
constexpr unsigned long kAlignment = 1ul << 12;

unsigned int ValueAt(std::uint32_t i) {
  return i * 2654435761u;
}

// What the read benchmarks must add up (modulo 2^32).
std::uint32_t ExpectedSum() {
  std::uint32_t sum = 0;
  for (std::uint32_t i = 0; i < kValues; ++i) sum += ValueAt(i);
  return sum;
}

// The bench file, created empty on first use and removed at exit.
class DataFile {
 public:
  static const DataFile& Get() {
    static const DataFile file;
    return file;
  }
  const std::string& Path() const { return path_; }
  File AsFile() const { return File(path_); }

  // Writes the values with stdio unless the file already holds them.
  void EnsureWritten() const {
    if (std::filesystem::file_size(path_) == static_cast<std::uintmax_t>(kBytes)) return;
    std::FILE* out = std::fopen(path_.c_str(), "wb");
    for (std::uint32_t i = 0; i < kValues; ++i) {
      const unsigned int v = ValueAt(i);
      for (int shift = 24; shift >= 0; shift -= 8) putc_unlocked(v >> shift & 0xFF, out);
    }
    std::fclose(out);
  }

 private:
  DataFile() {
    const char* tmp = std::getenv("TMPDIR");
    const std::filesystem::path dir = tmp != nullptr && *tmp != '\0' ? tmp : "/tmp";
    path_ = (dir / ("kelcore-filestreams-" + std::to_string(std::random_device()()))).string();
    std::fclose(std::fopen(path_.c_str(), "wb"));
  }
  ~DataFile() { std::filesystem::remove(path_); }

  std::string path_;
};

void write_u32_256mib_kelcore(benchmark::State& state) {
  const DataFile& data = DataFile::Get();
  for (auto _ : state) {
    OPlatformByteStream file(data.AsFile(), 0);
    OBufferedByteStream out(file, kBufferSize, kAlignment);
    out.Truncate(0);
    for (std::uint32_t i = 0; i < kValues; ++i) out << ValueAt(i);
  }
  state.SetBytesProcessed(state.iterations() * kBytes);
}
BENCHMARK(write_u32_256mib_kelcore)
    ->Name("write_u32_256mib@kelcore")
    ->Unit(benchmark::kMillisecond);

void write_u32_256mib_stdio(benchmark::State& state) {
  const DataFile& data = DataFile::Get();
  for (auto _ : state) {
    std::FILE* out = std::fopen(data.Path().c_str(), "wb");
    for (std::uint32_t i = 0; i < kValues; ++i) {
      const unsigned int v = ValueAt(i);
      putc_unlocked(v >> 24, out);
      putc_unlocked(v >> 16 & 0xFF, out);
      putc_unlocked(v >> 8 & 0xFF, out);
      putc_unlocked(v & 0xFF, out);
    }
    std::fclose(out);
  }
  state.SetBytesProcessed(state.iterations() * kBytes);
}
BENCHMARK(write_u32_256mib_stdio)->Name("write_u32_256mib@stdio")->Unit(benchmark::kMillisecond);

void read_u32_256mib_kelcore(benchmark::State& state) {
  const DataFile& data = DataFile::Get();
  data.EnsureWritten();
  std::uint32_t sum = 0;
  for (auto _ : state) {
    IPlatformByteStream file(data.AsFile(), 0);
    IBufferedByteStream in(file, kBufferSize, kAlignment);
    sum = 0;
    for (std::uint32_t i = 0; i < kValues; ++i) {
      unsigned int v;
      in >> v;
      sum += v;
    }
    benchmark::DoNotOptimize(sum);
  }
  if (sum != ExpectedSum()) state.SkipWithError("the values read back differ");
  state.SetBytesProcessed(state.iterations() * kBytes);
}
BENCHMARK(read_u32_256mib_kelcore)->Name("read_u32_256mib@kelcore")->Unit(benchmark::kMillisecond);

void read_u32_256mib_stdio(benchmark::State& state) {
  const DataFile& data = DataFile::Get();
  data.EnsureWritten();
  std::uint32_t sum = 0;
  for (auto _ : state) {
    std::FILE* in = std::fopen(data.Path().c_str(), "rb");
    sum = 0;
    for (std::uint32_t i = 0; i < kValues; ++i) {
      unsigned int v = static_cast<unsigned int>(getc_unlocked(in)) << 24;
      v |= static_cast<unsigned int>(getc_unlocked(in)) << 16;
      v |= static_cast<unsigned int>(getc_unlocked(in)) << 8;
      v |= static_cast<unsigned int>(getc_unlocked(in));
      sum += v;
    }
    std::fclose(in);
    benchmark::DoNotOptimize(sum);
  }
  if (sum != ExpectedSum()) state.SkipWithError("the values read back differ");
  state.SetBytesProcessed(state.iterations() * kBytes);
}
BENCHMARK(read_u32_256mib_stdio)->Name("read_u32_256mib@stdio")->Unit(benchmark::kMillisecond);

}  // namespace
