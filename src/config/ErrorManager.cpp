#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/ErrorManager.h>

#include <algorithm>
#include <new>
#include <stdexcept>

#include "config/ThreadErrorState.h"

namespace kelcore::config {
namespace {

// Sets the thread's raising-recorded-error flag for one DoThrowError call; a nested
// raise inside DoThrowError saves and restores it.
class RecordedErrorScope {
 public:
  RecordedErrorScope(ThreadErrorState& state, bool recorded)
      : state_(state), saved_(state.raisingRecordedError) {
    state.raisingRecordedError = recorded;
  }
  ~RecordedErrorScope() { state_.raisingRecordedError = saved_; }
  RecordedErrorScope(const RecordedErrorScope&) = delete;
  RecordedErrorScope& operator=(const RecordedErrorScope&) = delete;

 private:
  ThreadErrorState& state_;
  const bool saved_;
};

void HandleFailedAllocation() {
  if (!ErrorManager::Get(false)->PurgeMemory(0)) throw std::bad_alloc();
}

}  // namespace

ErrorManager* ErrorManager::S_managerP = nullptr;

ErrorManager::ErrorManager() = default;

ErrorManager::~ErrorManager() {
  if (S_managerP == this) S_managerP = nullptr;
  const std::lock_guard<std::recursive_mutex> lock(mutex_);
  for (auto& [threadId, list] : reporters_) {
    for (DeferredErrorReporter* reporter : list) reporter->manager_ = nullptr;
  }
}

bool ErrorManager::PurgeMemory(unsigned int) {
  return false;
}

void ErrorManager::IncrementLazilyDisplayErrors() {}

void ErrorManager::DecrementLazilyDisplayErrors() {}

long ErrorManager::ExecuteFunctionWithTopLevelExceptionHandler(boost::function0<long> function) {
  if (function.empty()) throw boost::bad_function_call();
  try {
    return function();
  } catch (...) {
    return 1;
  }
}

boost::intrusive_ptr<DeferredErrorReporter> ErrorManager::NewDeferredErrorReporter(
    bool reportWhenFinished) {
  return boost::intrusive_ptr<DeferredErrorReporter>(new DeferredErrorReporter(reportWhenFinished));
}

ErrorManager* ErrorManager::Get(bool allowNull) {
  if (S_managerP == nullptr && !allowNull) {
    throw std::logic_error("kel::config::ErrorManager not initialized. Check kel/config/Errors.");
  }
  return S_managerP;
}

void ErrorManager::Set(ErrorManager* manager) {
  S_managerP = manager;
}

void ErrorManager::ThrowErrorDispatch(ErrorLevel level, const char* key, unsigned long component,
                                      long errorNumber, bool deferralAllowed,
                                      const ReplacementValue& value1,
                                      const ReplacementValue& value2,
                                      const ReplacementValue& value3,
                                      const ReplacementValue& value4) {
  ThreadErrorState& thread = ThisThreadErrorState();
  // The reporter belongs to this thread, so it stays alive while this thread uses it.
  DeferredErrorReporter* reporter =
      deferralAllowed ? FindReporter(CurrentThreadId(thread)) : nullptr;
  if (reporter != nullptr) {
    reporter->Record(level, key, component, errorNumber, value1, value2, value3, value4);
  }
  const RecordedErrorScope scope(thread, reporter != nullptr);
  DoThrowError(level, key, component, errorNumber, deferralAllowed, value1, value2, value3, value4);
}

bool ErrorManager::IsErrorReportingDeferred() {
  return GetCurrentErrorReporterForThisThread() != nullptr;
}

bool ErrorManager::IsCurrentErrorRecorded() {
  return ThisThreadErrorState().raisingRecordedError;
}

void ErrorManager::AddDeferredErrorReporter(DeferredErrorReporter* reporter) {
  const std::uint32_t threadId = CurrentThreadId(ThisThreadErrorState());
  const std::lock_guard<std::recursive_mutex> lock(mutex_);
  reporters_[threadId].push_back(reporter);
  reporter->manager_ = this;
  reporter->threadId_ = threadId;
}

void ErrorManager::RemoveDeferredErrorReporter(DeferredErrorReporter* reporter) {
  const std::lock_guard<std::recursive_mutex> lock(mutex_);
  const auto entry = reporters_.find(reporter->threadId_);
  if (entry == reporters_.end()) return;
  ReporterList& list = entry->second;
  // Reporters usually end in the reverse order of their making: search from the back.
  const auto found = std::find(list.rbegin(), list.rend(), reporter);
  if (found == list.rend()) return;
  list.erase(std::next(found).base());
  if (list.empty()) reporters_.erase(entry);
  reporter->manager_ = nullptr;
}

DeferredErrorReporter* ErrorManager::GetCurrentErrorReporterForThisThread() {
  return FindReporter(CurrentThreadId(ThisThreadErrorState()));
}

ErrorManager::NewHandlerInitializer::NewHandlerInitializer() {
  std::set_new_handler(&HandleFailedAllocation);
}

ErrorManager::NewHandlerInitializer::~NewHandlerInitializer() {
  std::set_new_handler(nullptr);
}

}  // namespace kelcore::config
