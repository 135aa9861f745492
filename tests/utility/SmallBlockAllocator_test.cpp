#include <kelcore/utility/SmallBlockAllocator.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <deque>
#include <mutex>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

namespace kelcore::utility::SmallBlockAllocator {
namespace {

using Metrics::ClassFigures;

// The class sizes as the header lists them, ascending.
std::vector<unsigned int> ClassSizes() {
  std::vector<unsigned int> sizes = {8, 16, 24};
  for (unsigned int s = 32; s <= 256; s += 16) sizes.push_back(s);
  for (unsigned int s = 288; s <= 512; s += 32) sizes.push_back(s);
  sizes.insert(sizes.end(), {640, 768, 896, 1024});
  for (unsigned int s = 1152; s <= 4096; s += 128) sizes.push_back(s);
  sizes.push_back(4128);
  for (unsigned int s = 4352; s <= 8192; s += 256) sizes.push_back(s);
  sizes.push_back(66080);
  return sizes;
}

const ClassFigures& FiguresOf(const Metrics::Snapshot& snapshot, unsigned int blockSize) {
  for (const ClassFigures& figures : snapshot.classes) {
    if (figures.blockSize == blockSize) return figures;
  }
  throw std::logic_error("no class of size " + std::to_string(blockSize));
}

Metrics::Snapshot Snap() {
  Metrics::Snapshot snapshot;
  EXPECT_TRUE(Metrics::GetSnapshot(snapshot));
  return snapshot;
}

// A snapshot taken once the calling thread has its cache (which is a pool block itself).
Metrics::Snapshot Baseline() {
  Dispose(Allocate(1), 1);
  return Snap();
}

unsigned char Pattern(std::uintptr_t seed, std::size_t offset) {
  return static_cast<unsigned char>((seed * 131 + offset * 7) >> 3);
}

void Fill(void* block, unsigned int bytes, std::uintptr_t seed) {
  auto* p = static_cast<unsigned char*>(block);
  for (unsigned int i = 0; i < bytes; ++i) p[i] = Pattern(seed, i);
}

bool Intact(const void* block, unsigned int bytes, std::uintptr_t seed) {
  const auto* p = static_cast<const unsigned char*>(block);
  for (unsigned int i = 0; i < bytes; ++i) {
    if (p[i] != Pattern(seed, i)) return false;
  }
  return true;
}

TEST(SmallBlockAllocator, EverySizeGetsTheSmallestClassThatHoldsIt) {
  const std::vector<unsigned int> classes = ClassSizes();
  ASSERT_EQ(classes.size(), Metrics::kClassCount);
  for (unsigned int size = 0; size <= 8192; ++size) {
    const unsigned int expected = *std::lower_bound(classes.begin(), classes.end(), size);
    ASSERT_EQ(GetActualAllocationSize(size), expected) << "size " << size;
  }
  for (unsigned int size : {8193u, 66079u, 66080u, 925152u, UINT_MAX}) {
    EXPECT_EQ(GetActualAllocationSize(size), size);
  }
  const Metrics::Snapshot snapshot = Snap();
  for (std::size_t i = 0; i < classes.size(); ++i) {
    EXPECT_EQ(snapshot.classes[i].blockSize, classes[i]);
  }
}

// Sizes from 0 to 8192 (all up to 600, then every 37th, and every class size and the
// size after it) and a few beyond: blocks are usable for their full actual size,
// aligned as promised, and no two live blocks overlap.
TEST(SmallBlockAllocator, BlocksAreUsableAlignedAndDisjoint) {
  struct Live {
    unsigned char* block;
    unsigned int size;
    unsigned int usable;
  };
  std::vector<Live> live;
  for (unsigned int size = 0; size <= 8192; size += (size < 600 ? 1 : 37)) {
    for (int copy = 0; copy < 3; ++copy) live.push_back({nullptr, size, 0});
  }
  for (unsigned int size : ClassSizes()) {
    live.push_back({nullptr, size, 0});
    live.push_back({nullptr, size + 1, 0});
  }
  for (unsigned int size : {20000u, 925152u, 1u << 20}) live.push_back({nullptr, size, 0});
  for (Live& entry : live) {
    entry.block = static_cast<unsigned char*>(Allocate(entry.size));
    entry.usable = GetActualAllocationSize(entry.size);
    Fill(entry.block, entry.usable, reinterpret_cast<std::uintptr_t>(entry.block));
    const auto address = reinterpret_cast<std::uintptr_t>(entry.block);
    const bool eightAligned = entry.usable == 8 || entry.usable == 24;
    EXPECT_EQ(address % (eightAligned ? 8 : 16), 0u) << "size " << entry.size;
    if (entry.size > 8192 && entry.size != 66080) {
      EXPECT_EQ(address % 4096, 0u);
    }
  }
  std::sort(live.begin(), live.end(),
            [](const Live& a, const Live& b) { return a.block < b.block; });
  for (std::size_t i = 0; i < live.size(); ++i) {
    EXPECT_TRUE(
        Intact(live[i].block, live[i].usable, reinterpret_cast<std::uintptr_t>(live[i].block)));
    if (i + 1 < live.size()) {
      EXPECT_LE(live[i].block + live[i].usable, live[i + 1].block);
    }
  }
  for (const Live& entry : live) Dispose(entry.block, entry.size);
  Dispose(nullptr, 16);
}

// A class's chunks grow with the chunk bytes it already holds: first chunk size below
// the second chunk size, second chunk size below 925152, then 925152-byte system chunks.
// 1024 takes 4128/66080 chunks, 8192 takes 66080/925152, 66080 takes 925152 only.
TEST(SmallBlockAllocator, ChunkGrowthFollowsTheRunningTotal) {
  struct Case {
    unsigned int blockSize, first, second;
  };
  for (const Case c :
       {Case{1024, 4128, 66080}, Case{8192, 66080, 925152}, Case{66080, 925152, 925152}}) {
    SCOPED_TRACE(c.blockSize);
    std::vector<void*> blocks;
    ClassFigures before = FiguresOf(Snap(), c.blockSize);
    std::uint64_t systemChunks = Snap().systemChunks;
    int bigChunks = 0;
    while (bigChunks < 2) {
      blocks.push_back(Allocate(c.blockSize));
      const Metrics::Snapshot snapshot = Snap();
      const ClassFigures& now = FiguresOf(snapshot, c.blockSize);
      if (now.chunks == before.chunks) continue;
      ASSERT_EQ(now.chunks, before.chunks + 1);
      const std::uint64_t total = before.chunkBytes;
      const unsigned int expected = total < c.second ? c.first : total < 925152 ? c.second : 925152;
      ASSERT_EQ(now.chunkBytes - total, expected) << "after " << total << " bytes";
      if (expected == 925152) {
        ++bigChunks;
        EXPECT_GE(snapshot.systemChunks, systemChunks + 1);
      }
      systemChunks = snapshot.systemChunks;
      // Every carved block is accounted for exactly once.
      EXPECT_EQ(now.blocksInUse + now.blocksCached + now.blocksFree,
                before.blocksInUse + before.blocksCached + before.blocksFree +
                    (expected - 32) / c.blockSize);
      before = now;
    }
    for (void* block : blocks) Dispose(block, c.blockSize);
  }
}

TEST(SmallBlockAllocator, LargeBlocksComeFromVirtualMemory) {
  const Metrics::Snapshot before = Snap();
  std::vector<unsigned int> sizes = {8193, 925152, 3u << 20};
  std::vector<void*> blocks;
  for (unsigned int size : sizes) {
    blocks.push_back(Allocate(size));
    Fill(blocks.back(), size, size);
  }
  const Metrics::Snapshot during = Snap();
  EXPECT_EQ(during.largeBlocks, before.largeBlocks + 3);
  EXPECT_EQ(during.largeBytes, before.largeBytes + 8193 + 925152 + (3u << 20));
  for (std::size_t i = 0; i < sizes.size(); ++i) {
    EXPECT_TRUE(Intact(blocks[i], sizes[i], sizes[i]));
    Dispose(blocks[i], sizes[i]);
  }
  EXPECT_EQ(Snap().largeBlocks, before.largeBlocks);
}

struct alignas(64) Wide {
  double values[8];
};

// Bytes in use in the classes that never serve as chunks.
std::uint64_t PooledBytesInUse(const Metrics::Snapshot& snapshot) {
  std::uint64_t bytes = 0;
  for (const ClassFigures& figures : snapshot.classes) {
    if (figures.blockSize != 4128 && figures.blockSize != 66080) bytes += figures.bytesInUse;
  }
  return bytes;
}

TEST(SmallBlockAllocator, ContainersUseThePools) {
  const Metrics::Snapshot before = Baseline();
  {
    map<int, std::string> names;
    for (int i = 0; i < 2000; ++i) names.emplace(i, std::to_string(i));
    vector<int> numbers;
    for (int i = 0; i < 5000; ++i) numbers.push_back(i * 3);
    vector<Wide> wide(7);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(wide.data()) % 64, 0u);
    for (int i = 0; i < 5000; ++i) ASSERT_EQ(numbers[i], i * 3);
    for (int i = 0; i < 2000; ++i) ASSERT_EQ(names.at(i), std::to_string(i));
    const Metrics::Snapshot during = Snap();
    EXPECT_GE(PooledBytesInUse(during), PooledBytesInUse(before) + 2000 * sizeof(*names.begin()));
    EXPECT_EQ(during.largeBlocks, before.largeBlocks + 1);  // the numbers' 32 KiB
  }
  EXPECT_EQ(PooledBytesInUse(Snap()), PooledBytesInUse(before));
  EXPECT_THROW(STLAllocator<Wide>().allocate(std::size_t{1} << 60), std::bad_array_new_length);
}

struct Node : Allocated<Node> {
  explicit Node(bool fail = false) {
    if (fail) throw std::runtime_error("constructor failed");
  }
  virtual ~Node() = default;
  char payload[40] = {};
};

struct BigNode : Node {
  char more[400] = {};
};

TEST(SmallBlockAllocator, AllocatedRoutesNewAndDeleteThroughThePools) {
  const auto inUse = [](unsigned int size) {
    return FiguresOf(Snap(), GetActualAllocationSize(size)).blocksInUse;
  };
  const std::uint64_t small = inUse(sizeof(Node)), big = inUse(sizeof(BigNode));
  Node* node = new Node;
  Node* nothrowNode = new (std::nothrow) Node;
  Node* bigNode = new BigNode;  // deleted through the base: the virtual destructor passes its size
  EXPECT_EQ(inUse(sizeof(Node)), small + 2);
  EXPECT_EQ(inUse(sizeof(BigNode)), big + 1);
  delete node;
  delete nothrowNode;
  delete bigNode;
  EXPECT_THROW(static_cast<void>(new Node(true)), std::runtime_error);
  EXPECT_THROW(static_cast<void>(new (std::nothrow) Node(true)), std::runtime_error);
  EXPECT_EQ(inUse(sizeof(Node)), small);
  EXPECT_EQ(inUse(sizeof(BigNode)), big);

  alignas(Node) unsigned char place[sizeof(Node)];
  Node* placed = new (place) Node;
  EXPECT_EQ(static_cast<void*>(placed), place);
  placed->~Node();

  EXPECT_THROW(Node::operator new (std::size_t{1} << 40), std::bad_alloc);
  EXPECT_EQ(Node::operator new (std::size_t{1} << 40, std::nothrow), nullptr);
}

// Four threads pass blocks round a ring, so nearly every block is disposed on another
// thread than the one that allocated it; each receiver checks the sender's pattern.
TEST(SmallBlockAllocator, BlocksMayBeDisposedOnAnyThread) {
  constexpr int kThreads = 4;
  constexpr int kBlocksPerThread = 20000;
  struct Parcel {
    void* block;
    unsigned int size;
  };
  struct Mailbox {
    std::mutex lock;
    std::deque<Parcel> parcels;
  };
  const Metrics::Snapshot before = Snap();
  std::vector<Mailbox> mailboxes(kThreads);
  std::vector<int> corrupt(kThreads, 0);
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      std::mt19937 random(t);
      int received = 0;
      const auto receive = [&](bool all) {
        std::deque<Parcel> parcels;
        {
          std::lock_guard lock(mailboxes[t].lock);
          parcels.swap(mailboxes[t].parcels);
        }
        for (const Parcel& parcel : parcels) {
          const unsigned int checked = std::min(parcel.size, 64u);
          if (!Intact(parcel.block, checked, parcel.size)) ++corrupt[t];
          Dispose(parcel.block, parcel.size);
        }
        received += static_cast<int>(parcels.size());
        return all && received < kBlocksPerThread;
      };
      for (int n = 0; n < kBlocksPerThread; ++n) {
        const unsigned int size = n % 997 == 0   ? 66080
                                  : n % 499 == 0 ? 10000
                                                 : 1u << (random() % 14);
        void* block = Allocate(size);
        Fill(block, std::min(size, 64u), size);
        {
          std::lock_guard lock(mailboxes[(t + 1) % kThreads].lock);
          mailboxes[(t + 1) % kThreads].parcels.push_back({block, size});
        }
        if (n % 64 == 0) receive(false);
      }
      while (receive(true)) std::this_thread::yield();
    });
  }
  for (std::thread& thread : threads) thread.join();
  const Metrics::Snapshot after = Snap();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(corrupt[t], 0);
  for (std::size_t i = 0; i < Metrics::kClassCount; ++i) {
    // 4128- and 66080-byte blocks also serve as chunks of the classes that grew.
    if (before.classes[i].blockSize == 4128 || before.classes[i].blockSize == 66080) continue;
    EXPECT_EQ(after.classes[i].blocksInUse, before.classes[i].blocksInUse)
        << after.classes[i].blockSize;
  }
  EXPECT_EQ(after.largeBlocks, before.largeBlocks);
  EXPECT_EQ(after.threadCaches, before.threadCaches);
}

TEST(SmallBlockAllocator, AnEndingThreadHandsBackItsCache) {
  const Metrics::Snapshot before = Snap();
  std::uint64_t cachedWhileRunning = 0;
  std::thread([&] {
    std::vector<void*> blocks;
    for (int i = 0; i < 1000; ++i) blocks.push_back(Allocate(200));
    for (void* block : blocks) Dispose(block, 200);
    cachedWhileRunning = FiguresOf(Snap(), 208).blocksCached;
  }).join();
  EXPECT_GT(cachedWhileRunning, FiguresOf(before, 208).blocksCached);
  const Metrics::Snapshot after = Snap();
  EXPECT_EQ(after.threadCaches, before.threadCaches);
  EXPECT_EQ(FiguresOf(after, 208).blocksCached, FiguresOf(before, 208).blocksCached);
  EXPECT_EQ(FiguresOf(after, 208).blocksInUse, FiguresOf(before, 208).blocksInUse);
}

// With KELCORE_SMALLBLOCK=0 the pools stay off. The variable is read once per process,
// so the check runs in a child process that sets it before its first request.
void SwitchPoolsOffInThisProcess() {
#if defined(_WIN32)
  _putenv_s("KELCORE_SMALLBLOCK", "0");
#else
  setenv("KELCORE_SMALLBLOCK", "0", 1);
#endif
}

int CheckPoolsOff() {
  if (std::getenv("KELCORE_SMALLBLOCK") == nullptr) return 10;
  if (GetActualAllocationSize(5) != 5 || GetActualAllocationSize(0) != 0) return 11;
  void* small = Allocate(5);
  void* large = Allocate(8192);
  if (reinterpret_cast<std::uintptr_t>(small) % 16 != 0) return 12;
  std::memset(small, 1, 5);
  std::memset(large, 2, 8192);
  Metrics::Snapshot snapshot;
  if (Metrics::GetSnapshot(snapshot) || snapshot.poolsEnabled) return 13;
  if (snapshot.heapBlocks != 1 || snapshot.heapBytes != 5 || snapshot.largeBlocks != 1) return 14;
  if (snapshot.classes[0].blockSize != 0) return 15;
  Dispose(small, 5);
  Dispose(large, 8192);
  vector<int> numbers(1000, 7);
  return numbers[999] == 7 ? 0 : 16;
}

TEST(SmallBlockAllocatorDeathTest, PoolsCanBeSwitchedOff) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(
      {
        SwitchPoolsOffInThisProcess();
        std::exit(CheckPoolsOff());
      },
      testing::ExitedWithCode(0), "");
}

}  // namespace
}  // namespace kelcore::utility::SmallBlockAllocator
