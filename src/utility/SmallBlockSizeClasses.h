// The small-block allocator's size classes, its size table and the rule that sizes a
// class's next chunk. Everything here is a compile-time constant.
//
// A free block holds the link of its free list, so the smallest class is 8 bytes on
// every platform: requests of 0 to 8 bytes share it. That leaves 72 classes.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace kelcore::utility::smallblock {

// Blocks of up to this size come from the pools; larger requests go to the operating
// system, except requests of exactly kLargestClassSize, which have a class of their own.
inline constexpr unsigned int kMaxSmallSize = 8192;

// Chunks of this size come straight from the operating system.
inline constexpr unsigned int kSystemChunkSize = 925152;

// Every chunk starts with a header of this size; its blocks follow back to back.
inline constexpr unsigned int kChunkHeaderSize = 32;

struct SizeClass {
  unsigned int blockSize;
  unsigned int firstChunkSize;
  unsigned int secondChunkSize;
  // High-traffic class (small objects, 1 KiB buffers, chunk suppliers): its per-thread
  // cache holds twice as many blocks.
  bool deepCache;
};

inline constexpr std::size_t kClassCount = 72;

namespace detail {

constexpr std::array<SizeClass, kClassCount> MakeClasses() {
  std::array<SizeClass, kClassCount> classes{};
  std::size_t n = 0;
  const auto add = [&](unsigned int size, unsigned int first, unsigned int second, bool deep) {
    classes[n++] = SizeClass{size, first, second, deep};
  };
  for (unsigned int size : {8u, 16u, 24u, 32u, 48u, 64u, 80u, 96u, 112u, 128u}) {
    add(size, 4128, 66080, true);
  }
  for (unsigned int size = 144; size <= 256; size += 16) add(size, 4128, 66080, false);
  for (unsigned int size = 288; size <= 512; size += 32) add(size, 4128, 66080, false);
  for (unsigned int size : {640u, 768u, 896u}) add(size, 4128, 66080, false);
  add(1024, 4128, 66080, true);
  for (unsigned int size = 1152; size <= 4096; size += 128) add(size, 66080, 925152, false);
  add(4128, 66080, 925152, true);
  for (unsigned int size = 4352; size <= kMaxSmallSize; size += 256) {
    add(size, 66080, 925152, false);
  }
  add(66080, 925152, 925152, true);
  return classes;
}

}  // namespace detail

// Ascending by block size.
inline constexpr std::array<SizeClass, kClassCount> kClasses = detail::MakeClasses();

inline constexpr std::uint8_t kLargestClass = kClassCount - 1;
inline constexpr unsigned int kLargestClassSize = kClasses[kLargestClass].blockSize;  // 66080

constexpr std::uint8_t ClassOfBlockSize(unsigned int blockSize) {
  std::uint8_t index = 0;
  while (kClasses[index].blockSize != blockSize) ++index;
  return index;
}

// The class whose blocks serve as chunks of 4128 bytes.
inline constexpr std::uint8_t kChunkSupplierClass = ClassOfBlockSize(4128);

namespace detail {

constexpr std::array<std::uint8_t, kMaxSmallSize + 1> MakeSizeTable() {
  std::array<std::uint8_t, kMaxSmallSize + 1> table{};
  std::uint8_t index = 0;
  for (unsigned int size = 0; size <= kMaxSmallSize; ++size) {
    while (kClasses[index].blockSize < size) ++index;
    table[size] = index;
  }
  return table;
}

}  // namespace detail

// Request size (0 to 8192) -> index of the smallest class that holds it.
inline constexpr std::array<std::uint8_t, kMaxSmallSize + 1> kSizeTable = detail::MakeSizeTable();

// The size of a class's next chunk, given the running total of chunk bytes it has
// obtained so far: small totals take the first chunk size, then the second, and once
// the total reaches a system chunk, system chunks.
constexpr unsigned int NextChunkSize(const SizeClass& sizeClass, std::uint64_t total) {
  if (total < sizeClass.secondChunkSize) return sizeClass.firstChunkSize;
  if (total < kSystemChunkSize) return sizeClass.secondChunkSize;
  return kSystemChunkSize;
}

constexpr unsigned int BlocksPerChunk(const SizeClass& sizeClass, unsigned int chunkSize) {
  return (chunkSize - kChunkHeaderSize) / sizeClass.blockSize;
}

// Blocks moved between a thread's cache and the class's shared list at a time. A cache
// holds at most two batches per class, about 32 KiB (64 KiB for deep classes).
constexpr std::uint32_t BatchSize(const SizeClass& sizeClass) {
  const std::uint32_t budget = sizeClass.deepCache ? 32768 : 16384;
  const std::uint32_t blocks = budget / sizeClass.blockSize;
  return blocks < 2 ? 2 : (blocks > 128 ? 128 : blocks);
}

static_assert(kClasses[0].blockSize == 8 && kLargestClassSize == 66080);
static_assert(kClasses[kLargestClass - 1].blockSize == kMaxSmallSize);
static_assert(BlocksPerChunk(kClasses[kChunkSupplierClass], 66080) == 16);
static_assert(BlocksPerChunk(kClasses[kLargestClass], kSystemChunkSize) == 14);
static_assert(kSizeTable[0] == 0 && kSizeTable[9] == 1 && kSizeTable[kMaxSmallSize] == 70);

}  // namespace kelcore::utility::smallblock
