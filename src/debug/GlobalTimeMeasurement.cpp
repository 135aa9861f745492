#include <kelcore/debug/GlobalTimeMeasurement.h>

#include <kelcore/debug/Trace.h>
#include <kelcore/utility/HighPrecisionTime.h>

#include <atomic>
#include <cstdint>
#include <cstring>
#include <functional>
#include <mutex>
#include <thread>

namespace kelcore::debug {

namespace {

using utility::HighPrecisionTime;

struct Measurement {
  bool open = false;
  char category[GlobalTimeMeasurement::kMaxCategoryBytes + 1] = {};
  std::uint64_t start = 0;
  int stepsLeft = 0;
};

// Cached TraceEnabled answers by category and volume.
struct Decision {
  char category[GlobalTimeMeasurement::kMaxCategoryBytes + 1] = {};
  long volume = 0;
  bool enabled = false;
};
constexpr std::size_t kCachedDecisions = 32;

struct State {
  std::mutex lock;
  Measurement measurements[GlobalTimeMeasurement::kMaxMeasurements];
  Decision decisions[kCachedDecisions];
  std::size_t decisionCount = 0;
  std::size_t nextVictim = 0;
  int changeCount = -1;
  std::atomic<SafeTraceStream::PieceWriter> writer{nullptr};
  std::atomic<void*> context{nullptr};
};

State& TheState() {
  static State state;
  return state;
}

bool SameCategory(const char* stored, const char* category) {
  return std::strncmp(stored, category, GlobalTimeMeasurement::kMaxCategoryBytes) == 0;
}

void Store(char* target, const char* category) {
  std::strncpy(target, category, GlobalTimeMeasurement::kMaxCategoryBytes);
  target[GlobalTimeMeasurement::kMaxCategoryBytes] = 0;
}

Measurement* FindOpen(State& state, const char* category) {
  for (Measurement& m : state.measurements) {
    if (m.open && SameCategory(m.category, category)) return &m;
  }
  return nullptr;
}

// Asks the trace system outside the table's lock; the cache is consulted and filled
// under it.
bool Enabled(State& state, const char* category, long volume) {
  const int changes = TraceChangeCount();
  {
    std::lock_guard<std::mutex> hold(state.lock);
    if (changes != state.changeCount) {
      state.decisionCount = 0;
      state.changeCount = changes;
    }
    for (std::size_t i = 0; i < state.decisionCount; ++i) {
      const Decision& d = state.decisions[i];
      if (d.volume == volume && SameCategory(d.category, category)) return d.enabled;
    }
  }
  const bool enabled = TraceEnabled(reinterpret_cast<const unsigned char*>(category), volume, true);
  std::lock_guard<std::mutex> hold(state.lock);
  // Asking may have stored the category (a change): remember the count after it.
  const int after = TraceChangeCount();
  if (after != state.changeCount) {
    state.decisionCount = 0;
    state.changeCount = after;
  }
  std::size_t slot = state.decisionCount;
  if (slot == kCachedDecisions) {
    slot = state.nextVictim;
    state.nextVictim = (state.nextVictim + 1) % kCachedDecisions;
  } else {
    ++state.decisionCount;
  }
  Store(state.decisions[slot].category, category);
  state.decisions[slot].volume = volume;
  state.decisions[slot].enabled = enabled;
  return enabled;
}

// A template rather than std::function: writing a line must not touch the heap.
template <class Fill>
void WriteLine(State& state, const Fill& fill) {
  SafeTraceStream::PieceWriter writer = state.writer.load(std::memory_order_acquire);
  if (writer == nullptr) {
    SafeTraceStream stream;
    fill(stream);
  } else {
    SafeTraceStream stream(writer, state.context.load(std::memory_order_acquire));
    fill(stream);
  }
}

unsigned long long ThreadNumber() {
  return static_cast<unsigned long long>(std::hash<std::thread::id>()(std::this_thread::get_id()));
}

double MillisecondsSince(std::uint64_t start) {
  const std::uint64_t now = HighPrecisionTime::GetTickCount();
  return HighPrecisionTime::ConvertNanosToMilliSeconds(
      HighPrecisionTime::AbsoluteHostDeltaToNanos(start, now));
}

void WriteElapsed(State& state, const char* label, double milliseconds) {
  WriteLine(state, [&](SafeTraceStream& out) {
    out << "> [" << ThreadNumber() << "] " << label << " " << milliseconds << "ms\n";
  });
}

}  // namespace

void GlobalTimeMeasurement::BeginMeasurement(char const* category, char const* label, bool enabled,
                                             long volume) {
  (void)volume;  // Begin lines always go at volume 6.
  if (!enabled || category == nullptr || label == nullptr) return;
  State& state = TheState();
  bool acquired = false;
  {
    std::lock_guard<std::mutex> hold(state.lock);
    Measurement* entry = FindOpen(state, category);
    for (std::size_t i = 0; entry == nullptr && i < kMaxMeasurements; ++i) {
      if (!state.measurements[i].open) entry = &state.measurements[i];
    }
    if (entry != nullptr) {
      entry->open = true;
      Store(entry->category, category);
      entry->stepsLeft = kIntermediateSteps;
      entry->start = HighPrecisionTime::GetTickCount();
      acquired = true;
    }
  }
  if (!acquired) {
    if (Enabled(state, "GlobalTimeMeasurement", 6)) {
      WriteLine(state, [&](SafeTraceStream& out) {
        out << "> GlobalTimeMeasurement " << label
            << ": BeginMeasurement failed to aquire token when trying with " << category << "\n";
      });
    }
    return;
  }
  if (Enabled(state, category, 6)) {
    WriteLine(state, [&](SafeTraceStream& out) { out << label << " 0.0ms\n"; });
  }
}

void GlobalTimeMeasurement::IntermediateMeasurement(char const* category, char const* label,
                                                    bool enabled, int volume) {
  if (!enabled || category == nullptr || label == nullptr) return;
  State& state = TheState();
  std::uint64_t start;
  {
    std::lock_guard<std::mutex> hold(state.lock);
    Measurement* entry = FindOpen(state, category);
    if (entry == nullptr || --entry->stepsLeft <= 0) return;
    start = entry->start;
  }
  const double milliseconds = MillisecondsSince(start);
  if (Enabled(state, category, volume)) WriteElapsed(state, label, milliseconds);
}

void GlobalTimeMeasurement::EndMeasurement(char const* category, char const* label, bool enabled) {
  if (!enabled || category == nullptr || label == nullptr) return;
  State& state = TheState();
  std::uint64_t start;
  {
    std::lock_guard<std::mutex> hold(state.lock);
    Measurement* entry = FindOpen(state, category);
    if (entry == nullptr) return;
    start = entry->start;
    entry->open = false;
  }
  const double milliseconds = MillisecondsSince(start);
  if (Enabled(state, category, 6)) WriteElapsed(state, label, milliseconds);
}

void GlobalTimeMeasurement::SetLineWriter(SafeTraceStream::PieceWriter writer,
                                          void* context) noexcept {
  State& state = TheState();
  state.context.store(context, std::memory_order_release);
  state.writer.store(writer, std::memory_order_release);
}

}  // namespace kelcore::debug
