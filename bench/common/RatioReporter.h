// A console reporter that also lines up kelcore against its peers.
//
// Benchmarks are named "figure@implementation" (Google Benchmark may append its own
// suffixes such as "/threads:2" after the implementation). Runs whose implementation
// is "kelcore" are the reference; at the end the reporter prints one row per figure
// with each implementation's time per iteration and the ratio peer/kelcore, so that a
// ratio of 1.00 or more means kelcore is at least as fast.
#pragma once

#include <benchmark/benchmark.h>

#include <map>
#include <string>
#include <vector>

namespace kelbench {

class RatioReporter : public benchmark::ConsoleReporter {
 public:
  void ReportRuns(const std::vector<Run>& runs) override;
  void Finalize() override;

 private:
  struct Result {
    double nanoseconds = 0;
    bool fromAggregate = false;
  };
  // figure -> implementation -> result, in first-seen order of figures.
  std::vector<std::string> figureOrder_;
  std::map<std::string, std::map<std::string, Result>> results_;
};

}  // namespace kelbench
