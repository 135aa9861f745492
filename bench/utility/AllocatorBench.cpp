// The small-block allocator against glibc's malloc, mimalloc and jemalloc, in one run.
//
// Figures:
//   alloc_pair/N   one allocation of N bytes and its disposal, on one thread;
//   batch_random   10,000 blocks of random sizes (8 to 8192 bytes, log-uniform, so skewed
//                  to small sizes) allocated, each touched, then disposed in random
//                  order; on one thread and on two threads with a batch each.
//
// mimalloc and jemalloc both export `malloc`; linked normally, either would replace
// glibc's for the whole process. They are loaded with dlopen(RTLD_LOCAL) and called
// through their own entry points (mi_malloc/mi_free, mallocx/sdallocx), and the program
// checks that `malloc` is still glibc's. A peer that cannot be loaded is left out.
//
// jemalloc keeps 2.6 KiB of initial-exec thread-local storage, which a library loaded
// with dlopen can only take from the static TLS surplus glibc reserves at start-up (512
// bytes unless tuned), so the program re-executes itself once with a larger surplus.
#include <kelcore/utility/SmallBlockAllocator.h>

#include <benchmark/benchmark.h>
#include <dlfcn.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <vector>

namespace {

namespace sba = kelcore::utility::SmallBlockAllocator;

struct Kelcore {
  static void* Allocate(std::size_t size) { return sba::Allocate(static_cast<unsigned int>(size)); }
  static void Dispose(void* block, std::size_t size) {
    sba::Dispose(block, static_cast<unsigned int>(size));
  }
};

struct Glibc {
  static void* Allocate(std::size_t size) { return std::malloc(size); }
  static void Dispose(void* block, std::size_t) { std::free(block); }
};

struct Mimalloc {
  static inline void* (*malloc)(std::size_t) = nullptr;
  static inline void (*free)(void*) = nullptr;
  static void* Allocate(std::size_t size) { return malloc(size); }
  static void Dispose(void* block, std::size_t) { free(block); }
};

struct Jemalloc {
  static inline void* (*mallocx)(std::size_t, int) = nullptr;
  static inline void (*sdallocx)(void*, std::size_t, int) = nullptr;
  static void* Allocate(std::size_t size) { return mallocx(size, 0); }
  static void Dispose(void* block, std::size_t size) { sdallocx(block, size, 0); }
};

void ReserveStaticTlsForPeers() {
  constexpr const char* kSurplus = "glibc.rtld.optional_static_tls=16384";
  const char* tunables = std::getenv("GLIBC_TUNABLES");
  if (tunables != nullptr && std::strstr(tunables, "optional_static_tls") != nullptr) return;
  const std::string value =
      tunables != nullptr && *tunables != '\0' ? std::string(tunables) + ":" + kSurplus : kSurplus;
  setenv("GLIBC_TUNABLES", value.c_str(), 1);
  std::string commandLine;
  if (std::FILE* file = std::fopen("/proc/self/cmdline", "rb")) {
    char buffer[4096];
    for (std::size_t n; (n = std::fread(buffer, 1, sizeof buffer, file)) > 0;) {
      commandLine.append(buffer, n);
    }
    std::fclose(file);
  }
  std::vector<char*> arguments;
  for (std::size_t at = 0; at < commandLine.size(); at = commandLine.find('\0', at) + 1) {
    arguments.push_back(&commandLine[at]);
  }
  arguments.push_back(nullptr);
  execv("/proc/self/exe", arguments.data());
  std::fprintf(stderr, "bench_allocator: could not re-execute with more static TLS\n");
}

template <class Function>
bool Resolve(void* library, const char* name, Function& function) {
  function = reinterpret_cast<Function>(dlsym(library, name));
  return function != nullptr;
}

void* OpenPeer(const char* file) {
  void* library = dlopen(file, RTLD_NOW | RTLD_LOCAL);
  if (library == nullptr)
    std::fprintf(stderr, "bench_allocator: %s left out: %s\n", file, dlerror());
  return library;
}

bool LoadMimalloc() {
  void* library = OpenPeer("libmimalloc.so.2");
  return library != nullptr && Resolve(library, "mi_malloc", Mimalloc::malloc) &&
         Resolve(library, "mi_free", Mimalloc::free);
}

bool LoadJemalloc() {
  void* library = OpenPeer("libjemalloc.so.2");
  return library != nullptr && Resolve(library, "mallocx", Jemalloc::mallocx) &&
         Resolve(library, "sdallocx", Jemalloc::sdallocx);
}

// Stops the run if loading a peer has displaced glibc's malloc.
void CheckMallocIsGlibc() {
  Dl_info info{};
  void* global = dlsym(RTLD_DEFAULT, "malloc");
  if (dladdr(global, &info) == 0 || info.dli_fname == nullptr ||
      std::strstr(info.dli_fname, "libc.so") == nullptr) {
    std::fprintf(stderr, "bench_allocator: malloc does not resolve to glibc (%s)\n",
                 info.dli_fname != nullptr ? info.dli_fname : "?");
    std::exit(1);
  }
}

template <class Impl>
void AllocPair(benchmark::State& state, std::size_t size) {
  for (auto _ : state) {
    void* block = Impl::Allocate(size);
    benchmark::DoNotOptimize(block);
    Impl::Dispose(block, size);
  }
}

constexpr std::size_t kBatch = 10000;

struct Batch {
  std::vector<std::size_t> sizes;
  std::vector<std::size_t> disposalOrder;
  std::vector<void*> blocks;
};

Batch MakeBatch(unsigned int seed) {
  std::mt19937 random(seed);
  std::uniform_real_distribution<double> exponent(3.0, 13.0);
  Batch batch;
  for (std::size_t i = 0; i < kBatch; ++i) {
    batch.sizes.push_back(static_cast<std::size_t>(std::lround(std::exp2(exponent(random)))));
    batch.disposalOrder.push_back(i);
  }
  std::shuffle(batch.disposalOrder.begin(), batch.disposalOrder.end(), random);
  batch.blocks.resize(kBatch);
  return batch;
}

template <class Impl>
void BatchRandom(benchmark::State& state) {
  Batch batch = MakeBatch(1234 + static_cast<unsigned int>(state.thread_index()));
  for (auto _ : state) {
    for (std::size_t i = 0; i < kBatch; ++i) {
      batch.blocks[i] = Impl::Allocate(batch.sizes[i]);
      *static_cast<unsigned char*>(batch.blocks[i]) = static_cast<unsigned char>(i);
    }
    for (const std::size_t i : batch.disposalOrder) Impl::Dispose(batch.blocks[i], batch.sizes[i]);
  }
  state.SetItemsProcessed(static_cast<std::int64_t>(state.iterations() * kBatch));
}

struct Peer {
  const char* name;
  void (*allocPair)(benchmark::State&, std::size_t);
  void (*batchRandom)(benchmark::State&);
};

template <class Impl>
Peer MakePeer(const char* name) {
  return Peer{name, &AllocPair<Impl>, &BatchRandom<Impl>};
}

// Implementations of one figure run back to back, so they see the same machine load.
bool RegisterAll() {
  ReserveStaticTlsForPeers();
  std::vector<Peer> peers = {MakePeer<Kelcore>("kelcore"), MakePeer<Glibc>("glibc")};
  if (LoadMimalloc()) peers.push_back(MakePeer<Mimalloc>("mimalloc"));
  if (LoadJemalloc()) peers.push_back(MakePeer<Jemalloc>("jemalloc"));
  CheckMallocIsGlibc();
  for (std::size_t size = 16; size <= 8192; size *= 2) {
    for (const Peer& peer : peers) {
      const std::string name = "alloc_pair/" + std::to_string(size) + "@" + peer.name;
      benchmark::RegisterBenchmark(name.c_str(), peer.allocPair, size);
    }
  }
  for (int threads : {1, 2}) {
    for (const Peer& peer : peers) {
      const std::string name = std::string("batch_random@") + peer.name;
      benchmark::RegisterBenchmark(name.c_str(), peer.batchRandom)
          ->Threads(threads)
          ->UseRealTime()
          ->Unit(benchmark::kMicrosecond);
    }
  }
  return true;
}

const bool gRegistered = RegisterAll();

}  // namespace
