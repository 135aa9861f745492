// The cost of interning a text that already exists.
//
// create_existing: CreateDynamic of a text already in the table and held elsewhere, then
// dropping the new handle (the common case: a name looked up again and again). Each
// thread uses texts of its own, spread over different buckets, as threads interning
// their own names do; /threads:2 shows how it scales. Threaded runs report per-thread
// time and rate (Google Benchmark sums real time over threads), so flat figures mean the
// combined rate doubles. Peers, same work:
//   kelcore         ImmutableString::CreateDynamic + drop;
//   mutex_map       a std::unordered_map<std::string, int> lookup under one std::mutex
//                   (the straightforward intern table with a single lock).
// copy_drop: copying and dropping a handle (one atomic increment, one compare-and-swap).
#include <kelcore/utility/ImmutableString.h>

#include <benchmark/benchmark.h>

#include <mutex>
#include <string>
#include <unordered_map>
#include <vector>

namespace {

using kelcore::utility::ImmutableString;

constexpr int kTexts = 16;

std::vector<std::string> TextsOfThread(int thread) {
  std::vector<std::string> texts;
  for (int i = 0; i < kTexts; ++i) {
    texts.push_back("Property/Key/Name_" + std::to_string(thread) + "_" + std::to_string(i));
  }
  return texts;
}

void BM_CreateExisting(benchmark::State& state) {
  const std::vector<std::string> texts = TextsOfThread(state.thread_index());
  std::vector<ImmutableString> held;
  for (const std::string& text : texts) held.push_back(ImmutableString::CreateDynamic(text));
  int i = 0;
  for (auto _ : state) {
    ImmutableString s = ImmutableString::CreateDynamic(texts[i]);
    benchmark::DoNotOptimize(s.Data());
    i = (i + 1) % kTexts;
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_CreateExisting)->Name("create_existing@kelcore");
BENCHMARK(BM_CreateExisting)->Name("create_existing@kelcore")->Threads(2)->UseRealTime();

std::mutex gMapLock;
std::unordered_map<std::string, int> gMap;

void BM_CreateExistingMutexMap(benchmark::State& state) {
  const std::vector<std::string> texts = TextsOfThread(state.thread_index());
  {
    std::lock_guard<std::mutex> hold(gMapLock);
    for (const std::string& text : texts) gMap.emplace(text, 1);
  }
  int i = 0;
  for (auto _ : state) {
    std::lock_guard<std::mutex> hold(gMapLock);
    auto found = gMap.find(texts[i]);
    benchmark::DoNotOptimize(found);
    i = (i + 1) % kTexts;
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_CreateExistingMutexMap)->Name("create_existing@mutex_map");
BENCHMARK(BM_CreateExistingMutexMap)->Name("create_existing@mutex_map")->Threads(2)->UseRealTime();

void BM_CopyDrop(benchmark::State& state) {
  const ImmutableString s =
      ImmutableString::CreateDynamic("copy/drop/" + std::to_string(state.thread_index()));
  for (auto _ : state) {
    ImmutableString copy = s;
    benchmark::DoNotOptimize(copy.Data());
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_CopyDrop)->Name("copy_drop@kelcore");

}  // namespace
