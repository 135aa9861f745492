// GlobalTimeMeasurement: traces the time elapsed between named begin, intermediate and end
// points of a measurement, one open measurement per trace category.
//
//   GlobalTimeMeasurement::BeginMeasurement("Startup", "launch", true, 6);
//   GlobalTimeMeasurement::IntermediateMeasurement("Startup", "prefs loaded", true, 6);
//   GlobalTimeMeasurement::EndMeasurement("Startup", "window shown", true);
//
// Every call does nothing when `enabled` is false or the category or label is null.
// Lines (written only when `category` is enabled for tracing at the volume named below):
//   Begin:         "<label> 0.0ms\n"                                  (volume 6)
//   Intermediate:  "> [<thread>] <label> <milliseconds>ms\n"        (the given volume)
//   End:           "> [<thread>] <label> <milliseconds>ms\n"          (volume 6)
// <thread> is the calling thread's id in decimal; milliseconds are formatted "%lg".
// Begin's `volume` argument is not used: its line always goes at volume 6. Begin on a
// category that is already open starts it again. At most kMaxMeasurements
// categories are open at once; a Begin that finds no free entry writes, when the category
// "GlobalTimeMeasurement" is enabled at volume 6,
//   "> GlobalTimeMeasurement <label>: BeginMeasurement failed to aquire token when trying
//   with <category>\n"     (one line)
// and measures nothing. Each measurement allows kIntermediateSteps - 1 intermediate lines;
// later intermediate points are silent. Intermediate and End on a category that is not
// open do nothing. Categories are told apart by their first kMaxCategoryBytes bytes.
//
// Tracing decisions are cached and asked again only after TraceChangeCount() changes.
// Output goes through SafeTraceStream (no heap), by default to the debugger's output.
//
// Threads: any thread may call; the table and the cache are under one mutex, which is not
// held while lines are written or while the trace system is asked.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/SafeTraceStream.h>

#include <cstddef>

namespace kelcore::debug {

class KELCORE_API GlobalTimeMeasurement {
 public:
  static constexpr std::size_t kMaxMeasurements = 16;
  static constexpr int kIntermediateSteps = 100;
  static constexpr std::size_t kMaxCategoryBytes = 63;

  GlobalTimeMeasurement() = delete;

  static void BeginMeasurement(char const* category, char const* label, bool enabled, long volume);
  static void IntermediateMeasurement(char const* category, char const* label, bool enabled,
                                      int volume);
  static void EndMeasurement(char const* category, char const* label, bool enabled);

  // Sends the lines to `writer` (see SafeTraceStream) instead; null restores the
  // debugger's output. Meant for set-up, before measurements run.
  static void SetLineWriter(SafeTraceStream::PieceWriter writer, void* context) noexcept;
};

}  // namespace kelcore::debug
