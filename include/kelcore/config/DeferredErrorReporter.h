// A scope that collects the errors raised on its thread instead of letting them reach
// the user at once.
//
// Construction registers the reporter with the installed error manager for the calling
// thread; destruction unregisters it. While a thread has live reporters, an error
// raised with deferral allowed is recorded in the thread's oldest reporter only
// (nested reporters see nothing): each recording replaces the previous one and adds one
// to the error count. Finish() raises the recorded error when the reporter was asked
// to report when finished.
//
//   DeferredErrorReporter reporter(true);
//   ... work that may raise errors ...
//   reporter.Finish();  // raises the last recorded error, if any
//
// Reference counted (intrusive_ptr); a reporter held by an intrusive_ptr must come from
// ErrorManager::NewDeferredErrorReporter or new (both use the small-block allocator).
// A reporter belongs to the thread that made it: the counts and the recorded error are
// not synchronised, and it must not be released on another thread while its own thread
// may still raise errors.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/Errors.h>
#include <kelcore/config/ReplacementValue.h>
#include <kelcore/utility/RefCountedObject.h>

#include <cstddef>
#include <cstdint>
#include <string>

namespace kelcore::config {

class ErrorManager;

class KELCORE_API DeferredErrorReporter : public utility::RefCountedObject {
 public:
  // Registers the reporter for the calling thread. With no manager installed throws
  // std::logic_error "kel::config::ErrorManager not initialized. Check
  // kel/config/Errors.".
  explicit DeferredErrorReporter(bool reportWhenFinished);
  // Unregisters the reporter from the manager it registered with. Never throws: a
  // reporter is often destroyed while an error propagates, or inside an intrusive_ptr,
  // where a second exception would end the process. When that manager has been
  // destroyed meanwhile there is nothing to do.
  ~DeferredErrorReporter() override;
  DeferredErrorReporter(const DeferredErrorReporter&) = delete;
  DeferredErrorReporter& operator=(const DeferredErrorReporter&) = delete;

  bool GetReportErrorWhenFinished() const { return reportWhenFinished_; }
  void SetReportErrorWhenFinished(bool report) { reportWhenFinished_ = report; }

  // Adds one to the finish count. When report-when-finished is set and at least one
  // error was recorded since the last report, resets the error count to 0 and raises
  // the recorded error through the installed manager's DoThrowError (deferral allowed),
  // which normally throws. With no manager installed at that point it throws the "not
  // initialized" std::logic_error.
  virtual void Finish();

  // The recorded error: level -1 and component 111 until one is recorded.
  ErrorLevel GetLevel() const { return level_; }
  const std::string& GetKey() const { return key_; }
  std::uint32_t GetComponent() const { return component_; }
  std::int32_t GetErrorNumber() const { return errorNumber_; }
  // Values 0 to 3 fill "^1" to "^4"; any other index gives a value of kind none.
  const ReplacementValue& GetValue(std::size_t index) const;
  std::uint32_t GetErrorCount() const { return errorCount_; }
  std::uint32_t GetFinishCount() const { return finishCount_; }

  // Reporters live in blocks of the small-block allocator; when none can be had, new
  // throws std::bad_alloc ("bad allocation").
  static void* operator new(std::size_t size);
  static void operator delete(void* block, std::size_t size) noexcept;

 private:
  friend class ErrorManager;

  // Inline: it runs on every deferred raise.
  void Record(ErrorLevel level, const char* key, unsigned long component, long errorNumber,
              const ReplacementValue& value1, const ReplacementValue& value2,
              const ReplacementValue& value3, const ReplacementValue& value4) {
    level_ = level;
    key_.assign(key != nullptr ? key : "");
    component_ = static_cast<std::uint32_t>(component);
    errorNumber_ = static_cast<std::int32_t>(errorNumber);
    values_[0] = value1;
    values_[1] = value2;
    values_[2] = value3;
    values_[3] = value4;
    ++errorCount_;
  }

  bool reportWhenFinished_;
  ErrorLevel level_ = static_cast<ErrorLevel>(-1);
  std::string key_;
  std::uint32_t component_ = 111;
  std::int32_t errorNumber_ = 0;
  ReplacementValue values_[4];
  std::uint32_t errorCount_ = 0;
  std::uint32_t finishCount_ = 0;
  // Where the reporter is registered; the manager clears `manager_` when it dies.
  ErrorManager* manager_ = nullptr;
  std::uint32_t threadId_ = 0;
};

}  // namespace kelcore::config
