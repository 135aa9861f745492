// kelcore's executors against Boost.Asio and oneTBB, in one run.
//
// Figures (each peer with the same number of threads, one per processor):
//   post_1m/pool     1,000,000 empty functions posted from one thread to the CPU-bound
//                    executor (the library's thread pool) | asio::thread_pool | a TBB
//                    task arena; the time until the last one has run.
//   post_1m/queue    the same to a threaded work queue | asio::thread_pool | TBB.
//   post_1m/serial   the same to a sub-executor of concurrency 1 over the CPU-bound
//                    executor | an asio strand over asio::thread_pool.
//   delay_1ms/lateness  a call delayed by 1 ms, waited for, again and again: the time
//                    reported is the mean lateness (when it ran minus when it was due);
//                    the counters give the median, 99th percentile and maximum, and a
//                    histogram is printed after the run.
// Every function does the same thing: count down, and wake the waiting thread when it is
// the last one.
#include <kelcore/threads/Executors.h>

#include <benchmark/benchmark.h>
#include <tbb/global_control.h>
#include <tbb/task_arena.h>
#include <boost/asio/post.hpp>
#include <boost/asio/steady_timer.hpp>
#include <boost/asio/strand.hpp>
#include <boost/asio/thread_pool.hpp>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace {

namespace kt = kelcore::threads;
using Clock = std::chrono::steady_clock;

constexpr int kFunctions = 1000000;

int Threads() {
  return kt::CPUCount();
}

// Counts the functions down; the last one wakes the thread waiting in Wait.
class Completion {
 public:
  explicit Completion(int count) : left_(count) {}
  void Arrive() {
    if (left_.fetch_sub(1, std::memory_order_acq_rel) == 1) {
      done_.store(1, std::memory_order_release);
      done_.notify_one();
    }
  }
  void Wait() { done_.wait(0, std::memory_order_acquire); }

 private:
  std::atomic<int> left_;
  std::atomic<int> done_{0};
};

template <class PostOne>
void PostMillion(benchmark::State& state, PostOne&& post) {
  for (auto _ : state) {
    Completion completion(kFunctions);
    Completion* target = &completion;
    for (int i = 0; i < kFunctions; ++i) post([target] { target->Arrive(); });
    completion.Wait();
  }
  state.SetItemsProcessed(state.iterations() * kFunctions);
}

void PostPoolKelcore(benchmark::State& state) {
  const kt::AsyncExecutorPtr executor = kt::CreateCPUBoundExecutor();
  PostMillion(state, [&](const auto& fn) { executor->CallAsynchronously(fn, 0); });
}

void PostQueueKelcore(benchmark::State& state) {
  const kt::AsyncThreadedExecutorPtr queue =
      kt::CreateAsyncThreadedExecutor("bench queue", Threads(), kt::kThreadPriorityNormal, {}, {});
  PostMillion(state, [&](const auto& fn) { queue->CallAsynchronously(fn, 0); });
}

void PostSerialKelcore(benchmark::State& state) {
  const kt::AsyncThreadedExecutorPtr serial =
      kt::CreateSubExecutor(kt::CreateCPUBoundExecutor(), 1);
  PostMillion(state, [&](const auto& fn) { serial->CallAsynchronously(fn, 0); });
}

void PostAsio(benchmark::State& state) {
  boost::asio::thread_pool pool(static_cast<std::size_t>(Threads()));
  PostMillion(state, [&](const auto& fn) { boost::asio::post(pool, fn); });
  pool.join();
}

void PostSerialAsio(benchmark::State& state) {
  boost::asio::thread_pool pool(static_cast<std::size_t>(Threads()));
  auto strand = boost::asio::make_strand(pool.get_executor());
  PostMillion(state, [&](const auto& fn) { boost::asio::post(strand, fn); });
  pool.join();
}

void PostTbb(benchmark::State& state) {
  // Workers for every slot of the arena (the posting thread takes none).
  tbb::global_control workers(tbb::global_control::max_allowed_parallelism,
                              static_cast<std::size_t>(Threads()) + 1);
  tbb::task_arena arena(Threads(), 0);
  PostMillion(state, [&](const auto& fn) { arena.enqueue(fn); });
}

// Lateness of 1 ms delayed calls: the reported time per iteration is the lateness.
class LatenessRecord {
 public:
  void Add(double microseconds) { samples_.push_back(microseconds); }

  void Report(benchmark::State& state, const char* who) {
    if (samples_.empty()) return;
    std::sort(samples_.begin(), samples_.end());
    const auto at = [&](double fraction) {
      return samples_[std::min(
          samples_.size() - 1,
          static_cast<std::size_t>(fraction * static_cast<double>(samples_.size())))];
    };
    state.counters["p50_us"] = at(0.50);
    state.counters["p99_us"] = at(0.99);
    state.counters["max_us"] = samples_.back();
    const double bounds[] = {50, 100, 200, 500, 1000, 2000, 5000};
    std::printf("\n%s: lateness of %zu calls delayed by 1 ms (median %.0f us, p99 %.0f us)\n", who,
                samples_.size(), at(0.5), at(0.99));
    double lower = 0;
    std::size_t index = 0;
    for (const double bound : bounds) {
      std::size_t count = 0;
      while (index < samples_.size() && samples_[index] < bound) ++count, ++index;
      std::printf("  %5.0f - %5.0f us %6zu %s\n", lower, bound, count,
                  std::string(count * 60 / samples_.size(), '#').c_str());
      lower = bound;
    }
    std::printf("  %5.0f us and more %4zu\n", lower, samples_.size() - index);
    std::fflush(stdout);
  }

 private:
  std::vector<double> samples_;
};

template <class ScheduleOne>
void MeasureLateness(benchmark::State& state, const char* who, ScheduleOne&& schedule) {
  LatenessRecord record;
  for (auto _ : state) {
    std::atomic<Clock::rep> ranAt{0};
    std::atomic<int> done{0};
    const Clock::time_point posted = Clock::now();
    schedule([&] {
      ranAt.store(Clock::now().time_since_epoch().count(), std::memory_order_relaxed);
      done.store(1, std::memory_order_release);
      done.notify_one();
    });
    done.wait(0, std::memory_order_acquire);
    const Clock::time_point ran{Clock::duration(ranAt.load(std::memory_order_relaxed))};
    const auto late = std::chrono::duration<double>(ran - (posted + std::chrono::milliseconds(1)));
    record.Add(late.count() * 1e6);
    state.SetIterationTime(std::max(late.count(), 0.0));
  }
  record.Report(state, who);
}

void DelayKelcore(benchmark::State& state) {
  const kt::AsyncExecutorPtr executor = kt::CreateCPUBoundExecutor();
  MeasureLateness(state, "kelcore CPU-bound executor",
                  [&](const auto& fn) { executor->CallAsynchronously(fn, 1); });
}

void DelayAsio(benchmark::State& state) {
  boost::asio::thread_pool pool(static_cast<std::size_t>(Threads()));
  MeasureLateness(state, "asio steady_timer on thread_pool", [&](const auto& fn) {
    auto timer = std::make_shared<boost::asio::steady_timer>(pool, std::chrono::milliseconds(1));
    timer->async_wait([timer, fn](const boost::system::error_code&) { fn(); });
  });
  pool.join();
}

constexpr int kLatenessSamples = 2000;

}  // namespace

BENCHMARK(PostPoolKelcore)
    ->Name("post_1m/pool@kelcore")
    ->UseRealTime()
    ->Unit(benchmark::kMillisecond);
BENCHMARK(PostAsio)->Name("post_1m/pool@asio")->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(PostTbb)->Name("post_1m/pool@tbb")->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(PostQueueKelcore)
    ->Name("post_1m/queue@kelcore")
    ->UseRealTime()
    ->Unit(benchmark::kMillisecond);
BENCHMARK(PostAsio)->Name("post_1m/queue@asio")->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(PostTbb)->Name("post_1m/queue@tbb")->UseRealTime()->Unit(benchmark::kMillisecond);
BENCHMARK(PostSerialKelcore)
    ->Name("post_1m/serial@kelcore")
    ->UseRealTime()
    ->Unit(benchmark::kMillisecond);
BENCHMARK(PostSerialAsio)
    ->Name("post_1m/serial@asio")
    ->UseRealTime()
    ->Unit(benchmark::kMillisecond);
BENCHMARK(DelayKelcore)
    ->Name("delay_1ms/lateness@kelcore")
    ->UseManualTime()
    ->Iterations(kLatenessSamples)
    ->Unit(benchmark::kMicrosecond);
BENCHMARK(DelayAsio)
    ->Name("delay_1ms/lateness@asio")
    ->UseManualTime()
    ->Iterations(kLatenessSamples)
    ->Unit(benchmark::kMicrosecond);
