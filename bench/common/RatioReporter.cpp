#include "common/RatioReporter.h"

#include <algorithm>
#include <cstdio>

namespace kelbench {
namespace {

constexpr const char* kReference = "kelcore";

double ToNanoseconds(double value, benchmark::TimeUnit unit) {
  switch (unit) {
    case benchmark::kNanosecond: return value;
    case benchmark::kMicrosecond: return value * 1e3;
    case benchmark::kMillisecond: return value * 1e6;
    case benchmark::kSecond: return value * 1e9;
  }
  return value;
}

std::string FormatTime(double ns) {
  char text[32];
  if (ns < 1e3) {
    std::snprintf(text, sizeof text, "%.2f ns", ns);
  } else if (ns < 1e6) {
    std::snprintf(text, sizeof text, "%.2f us", ns / 1e3);
  } else {
    std::snprintf(text, sizeof text, "%.2f ms", ns / 1e6);
  }
  return text;
}

// Splits "figure@impl/suffix" into ("figure/suffix", "impl").
bool SplitName(const std::string& name, std::string& figure, std::string& impl) {
  const auto at = name.find('@');
  if (at == std::string::npos) return false;
  const auto end = name.find('/', at);
  impl = name.substr(at + 1, end == std::string::npos ? std::string::npos : end - at - 1);
  figure = name.substr(0, at) + (end == std::string::npos ? "" : name.substr(end));
  return true;
}

}  // namespace

void RatioReporter::ReportRuns(const std::vector<Run>& runs) {
  ConsoleReporter::ReportRuns(runs);
  for (const Run& run : runs) {
    if (run.error_occurred) continue;
    const bool aggregate = run.run_type == Run::RT_Aggregate;
    // With repetitions only the median counts; without, the single iteration run.
    if (aggregate && run.aggregate_name != "median") continue;
    std::string figure, impl;
    if (!SplitName(run.run_name.str(), figure, impl)) continue;
    if (results_.find(figure) == results_.end()) figureOrder_.push_back(figure);
    Result& slot = results_[figure][impl];
    if (slot.fromAggregate && !aggregate) continue;
    slot.nanoseconds = ToNanoseconds(run.GetAdjustedRealTime(), run.time_unit);
    slot.fromAggregate = aggregate;
  }
}

void RatioReporter::Finalize() {
  ConsoleReporter::Finalize();
  if (figureOrder_.empty()) return;
  std::FILE* out = stdout;
  std::fprintf(out, "\nkelcore against its peers (time per iteration; ratio = peer / kelcore, "
                    ">= 1.00 means kelcore is at least as fast)\n");
  for (const std::string& figure : figureOrder_) {
    const auto& impls = results_[figure];
    const auto ref = impls.find(kReference);
    std::fprintf(out, "  %-44s", figure.c_str());
    if (ref != impls.end()) {
      std::fprintf(out, " %s %-10s", kReference, FormatTime(ref->second.nanoseconds).c_str());
    }
    for (const auto& [impl, result] : impls) {
      if (impl == kReference) continue;
      std::fprintf(out, " | %s %s", impl.c_str(), FormatTime(result.nanoseconds).c_str());
      if (ref != impls.end() && ref->second.nanoseconds > 0) {
        std::fprintf(out, " (%.2fx)", result.nanoseconds / ref->second.nanoseconds);
      }
    }
    std::fprintf(out, "\n");
  }
  std::fflush(out);
}

}  // namespace kelbench
