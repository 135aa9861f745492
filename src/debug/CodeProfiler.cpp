#include <kelcore/debug/CodeProfiler.h>

#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/debug/Trace.h>
#include <kelcore/utility/HighPrecisionTime.h>

#include <locale>
#include <sstream>

namespace kelcore::debug {

using utility::HighPrecisionTime;

CodeProfiler::CodeProfiler(boost::intrusive_ptr<ProfileDataLog> log) : log_(std::move(log)) {
  if (log_) start_ = HighPrecisionTime::GetTickCount();
}

void CodeProfiler::StopProfiling() {
  if (!log_) return;
  const std::uint64_t now = HighPrecisionTime::GetTickCount();
  log_->AddTime(now >= start_ ? now - start_ : 0);
  log_.reset();
}

CodeProfilerManager& CodeProfilerManager::Get() {
  static CodeProfilerManager manager;
  return manager;
}

// An absent switch counts as off and is not created.
CodeProfilerManager::CodeProfilerManager() {
  const UTF8String key(reinterpret_cast<const unsigned char*>("CodeProfiler_AutoStart"));
  conditional_.store(DebugDatabase::Instance().GetEntry(key) == DebugDatabase::kTrueText,
                     std::memory_order_relaxed);
}

boost::intrusive_ptr<ProfileDataLog> CodeProfilerManager::CreateNewProfileDataLog(char const* id,
                                                                                  long volume) {
  const std::string name = id == nullptr ? "" : id;
  std::lock_guard<std::mutex> hold(lock_);
  auto found = logs_.find(name);
  if (found != logs_.end()) return found->second;
  boost::intrusive_ptr<ProfileDataLog> log(new ProfileDataLog(name.c_str(), volume));
  logs_.emplace(name, log);
  return log;
}

boost::intrusive_ptr<ProfileDataLog> CodeProfilerManager::GetProfileDataLog(char const* id) {
  const std::string name = id == nullptr ? "" : id;
  std::lock_guard<std::mutex> hold(lock_);
  auto found = logs_.find(name);
  return found == logs_.end() ? nullptr : found->second;
}

void CodeProfilerManager::GetAllProfileDataLogs(LogMap& logs) {
  std::lock_guard<std::mutex> hold(lock_);
  logs = logs_;
}

std::string CodeProfilerManager::FormatDumpLine(const ProfileDataLog& log) {
  const ProfileDataLog::ProfileData data = log.GetProfileData();
  std::ostringstream line;
  line.imbue(std::locale::classic());
  line << "---Profile data log dump.  " << log.GetID() << " - Total calls: " << data.numLogs
       << "   Total time: " << data.totalTime << "   Average time: " << data.averageTime
       << "   Longest time: " << data.longestTime << "   Shortest time: " << data.shortestTime
       << "\n";
  return line.str();
}

void CodeProfilerManager::DumpProfilingData(
    const std::function<void(const std::string& line)>& write) {
  std::lock_guard<std::mutex> hold(lock_);
  for (const auto& [name, log] : logs_) {
    if (log->GetNumLogs() != 0) write(FormatDumpLine(*log));
  }
}

void CodeProfilerManager::DumpProfilingDataToDebugOut() {
  DumpProfilingData([](const std::string& line) {
    DebugTrace(reinterpret_cast<const unsigned char*>(line.c_str()));
  });
}

}  // namespace kelcore::debug
