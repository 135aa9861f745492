#include <kelcore/debug/TraceHandlerInstaller.h>

#include "debug/ConsoleLogOutput.h"
#include "debug/TraceDatabaseText.h"

#include <kelcore/debug/AsyncTraceHandler.h>
#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/debug/RollingTraceHandler.h>
#include <kelcore/debug/TimestampTraceHandler.h>

#include <algorithm>

namespace kelcore::debug {

namespace {

// Absent entries count as off and are not created.
bool SwitchIsOn(DebugDatabase& database, const char* key) {
  return database.GetEntry(reinterpret_cast<const unsigned char*>(key)) == DebugDatabase::kTrueText;
}

std::uint64_t NumberEntry(DebugDatabase& database, const char* key) {
  const UTF8String text = database.GetEntry(reinterpret_cast<const unsigned char*>(key));
  const std::int64_t value = ParseLeadingInteger(text.data(), text.data() + text.size());
  return static_cast<std::uint64_t>(std::max<std::int64_t>(value, 0));
}

}  // namespace

struct TraceHandlerInstaller::Installation {
  Installation();
  ~Installation();
  Installation(const Installation&) = delete;
  Installation& operator=(const Installation&) = delete;

  std::shared_ptr<RollingTraceHandler> rolling;
  std::shared_ptr<TimestampTraceHandler> timestamp;
  std::shared_ptr<AsyncTraceHandler> async;
  bool installedAny = false;
};

TraceHandlerInstaller::Installation::Installation() try {
  DebugDatabase& database = DebugDatabase::Instance();
  RollingTraceHandler::Options options;
  options.timestampedLogNames = SwitchIsOn(database, "AddTimestampToLogFileNames");
  if (options.timestampedLogNames) UseTimestampedConsoleLogNames();

  options.maxLogSize = NumberEntry(database, "MaxLogSize");
  options.createMissingLogs = SwitchIsOn(database, "CreateLogFilesThatDoNotExist");
  options.rollDaily = SwitchIsOn(database, "RolloverLogsDaily");
  if (options.maxLogSize > 0 || options.rollDaily) {
    rolling = std::make_shared<RollingTraceHandler>(options);
    InstallMasterTraceHandler(rolling.get());
    installedAny = true;
  }
  if (SwitchIsOn(database, "AddUTCTimestampToTraces")) {
    timestamp = std::make_shared<TimestampTraceHandler>();
    InstallMasterTraceHandler(timestamp.get());
    installedAny = true;
  }
  if (SwitchIsOn(database, "TraceAsync")) {
    async = std::make_shared<AsyncTraceHandler>();
    InstallMasterTraceHandler(async.get());
    installedAny = true;
  }
} catch (...) {
  // The handlers made so far are destroyed on the way out: the master must not point
  // at them.
  if (installedAny) RemoveMasterTraceHandler();
  throw;
}

TraceHandlerInstaller::Installation::~Installation() {
  if (installedAny) RemoveMasterTraceHandler();
  // The asynchronous handler drains into the others, so it goes first.
  async.reset();
  timestamp.reset();
  rolling.reset();
}

TraceHandlerInstaller::TraceHandlerInstaller() : installation_(std::make_shared<Installation>()) {}

TraceHandlerInstaller::TraceHandlerInstaller(const TraceHandlerInstaller& other) = default;

TraceHandlerInstaller& TraceHandlerInstaller::operator=(const TraceHandlerInstaller& other) =
    default;

TraceHandlerInstaller::~TraceHandlerInstaller() = default;

bool TraceHandlerInstaller::InstalledAny() const {
  return installation_->installedAny;
}

}  // namespace kelcore::debug
