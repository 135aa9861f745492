// Byte stream filters on large blocks and on image rows.
//
// crc32_64mib: the CRC-32 of 64 MiB of pseudo-random bytes written with one WriteBlock
// into an OCRCByteStream over a counting stream (kelcore), against zlib's crc32() on the
// same bytes. rle_write_rows / rle_read_rows: PackBits encoding and decoding of 8-bit
// image rows through WriteBlock/ReadBlock over memory buffers, one Flush per row as an
// image writer does; bytes processed are the unencoded bytes.
#include <kelcore/filesupport/BufferByteStream.h>
#include <kelcore/filesupport/CRCByteStream.h>
#include <kelcore/filesupport/CountingByteStream.h>
#include <kelcore/filesupport/RLEByteStream.h>

#include <benchmark/benchmark.h>
#include <zlib.h>

#include <cstdint>
#include <vector>

namespace {

using namespace kelcore::filesupport;

constexpr std::size_t kCrcBytes = 64u << 20;
constexpr std::size_t kRowWidth = 4096;
constexpr std::size_t kRows = 256;

std::uint32_t NextRandom(std::uint32_t& state) {
  state = state * 1664525u + 1013904223u;
  return state >> 8;
}

const std::vector<unsigned char>& RandomBytes() {
  static const std::vector<unsigned char> bytes = [] {
    std::vector<unsigned char> data(kCrcBytes);
    std::uint32_t state = 1;
    for (auto& b : data) b = static_cast<unsigned char>(NextRandom(state));
    return data;
  }();
  return bytes;
}

// A plane of 8-bit rows of the kinds PackBits sees in practice: flat backgrounds with a
// few shapes (long runs), graphics with bands of flat colour (runs of every length), and
// photographic rows (a smooth gradient with sensor noise: mostly literals).
const std::vector<unsigned char>& ImageRows() {
  static const std::vector<unsigned char> rows = [] {
    std::vector<unsigned char> data(kRowWidth * kRows);
    std::uint32_t state = 7;
    for (std::size_t y = 0; y < kRows; ++y) {
      unsigned char* row = data.data() + y * kRowWidth;
      switch (y % 3) {
        case 0:
          for (std::size_t x = 0; x < kRowWidth; ++x) {
            row[x] = (x / 512 + y / 32) % 5 == 0 ? 40 : 255;
          }
          break;
        case 1: {
          std::size_t x = 0;
          while (x < kRowWidth) {
            const std::size_t band = 1 + NextRandom(state) % 40;
            const auto value = static_cast<unsigned char>(NextRandom(state));
            for (std::size_t i = 0; i < band && x < kRowWidth; ++i) row[x++] = value;
          }
          break;
        }
        default:
          for (std::size_t x = 0; x < kRowWidth; ++x) {
            row[x] = static_cast<unsigned char>(x / 32 + y + NextRandom(state) % 7);
          }
          break;
      }
    }
    return data;
  }();
  return rows;
}

void crc32_64mib_kelcore(benchmark::State& state) {
  const auto& data = RandomBytes();
  for (auto _ : state) {
    OCountingByteStream sink;
    OCRCByteStream crc(sink);
    crc.WriteBlock(data.data(), static_cast<unsigned long>(data.size()));
    benchmark::DoNotOptimize(crc.Value());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * data.size()));
}
BENCHMARK(crc32_64mib_kelcore)->Name("crc32_64mib@kelcore")->Unit(benchmark::kMillisecond);

void crc32_64mib_zlib(benchmark::State& state) {
  const auto& data = RandomBytes();
  for (auto _ : state) {
    benchmark::DoNotOptimize(crc32_z(crc32_z(0, nullptr, 0), data.data(), data.size()));
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * data.size()));
}
BENCHMARK(crc32_64mib_zlib)->Name("crc32_64mib@zlib")->Unit(benchmark::kMillisecond);

std::vector<unsigned char> EncodeRows(const std::vector<unsigned char>& rows,
                                      std::vector<unsigned char>& buffer) {
  OBufferByteStream out(buffer.data(), buffer.size());
  ORLEByteStream rle(out);
  for (std::size_t y = 0; y < kRows; ++y) {
    rle.WriteBlock(rows.data() + y * kRowWidth, kRowWidth);
    rle.Flush();
  }
  return std::vector<unsigned char>(buffer.begin(),
                                    buffer.begin() + static_cast<std::ptrdiff_t>(out.Count()));
}

void rle_write_rows_kelcore(benchmark::State& state) {
  const auto& rows = ImageRows();
  std::vector<unsigned char> buffer(rows.size() * 2);
  std::size_t encoded = 0;
  for (auto _ : state) {
    encoded = EncodeRows(rows, buffer).size();
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * rows.size()));
  state.counters["ratio"] = static_cast<double>(encoded) / static_cast<double>(rows.size());
}
BENCHMARK(rle_write_rows_kelcore)->Name("rle_write_rows@kelcore");

void rle_read_rows_kelcore(benchmark::State& state) {
  const auto& rows = ImageRows();
  std::vector<unsigned char> scratch(rows.size() * 2);
  const std::vector<unsigned char> encoded = EncodeRows(rows, scratch);
  std::vector<unsigned char> decoded(rows.size());
  for (auto _ : state) {
    IBufferByteStream in(encoded.data(), encoded.size());
    IRLEByteStream rle(in);
    for (std::size_t y = 0; y < kRows; ++y)
      rle.ReadBlock(decoded.data() + y * kRowWidth, kRowWidth);
    benchmark::ClobberMemory();
  }
  if (decoded != rows) state.SkipWithError("decoded rows differ");
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * rows.size()));
}
BENCHMARK(rle_read_rows_kelcore)->Name("rle_read_rows@kelcore");

}  // namespace
