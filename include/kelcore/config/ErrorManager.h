// The process-wide error manager: the object through which every error of the library
// reaches the host application.
//
// The host derives its own manager, implements DoThrowError (usually: build the text
// with SubstituteErrorMessage and throw its own exception type) and installs it with
// Set at start-up; kelcore::config::DefaultErrorManager serves hosts without one. The
// manager also keeps, per thread, the stack of live deferred error reporters
// (kelcore::config::DeferredErrorReporter): while a thread has one, the errors it
// raises with deferral allowed are recorded in its oldest reporter.
//
// Threads: the installed-manager slot is a plain pointer that the host sets before
// other threads start and leaves alone while they run. The reporter map is guarded by a
// recursive mutex, taken for each lookup, registration and removal and released before
// any reporter or virtual operation is called. The map's key is the calling thread's
// id: the kernel thread id on Linux (gettid, cached per thread and refreshed in a
// forked child), GetCurrentThreadId on Windows; ids of live threads are unique, so
// every thread sees only its own reporters.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/Errors.h>
#include <kelcore/config/ReplacementValue.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include <boost/function.hpp>
#include <boost/intrusive_ptr.hpp>

#include <cstdint>
#include <mutex>

namespace kelcore::config {

class KELCORE_API ErrorManager {
 public:
  class NewHandlerInitializer;

  ErrorManager();
  ErrorManager(const ErrorManager&) = delete;
  ErrorManager& operator=(const ErrorManager&) = delete;
  // Uninstalls this manager if it is the installed one. Reporters still registered
  // with it are detached: they stay usable and no longer refer to it.
  virtual ~ErrorManager();

  // Asked to free memory when an allocation fails while a NewHandlerInitializer lives;
  // true means memory was freed and the allocation is retried. The C++ runtime does not
  // tell how much was asked for, so `bytes` is 0 ("as much as you can"). The base
  // frees nothing and returns false.
  virtual bool PurgeMemory(unsigned int bytes);

  // The host's counter of errors to display lazily; the base keeps none.
  virtual void IncrementLazilyDisplayErrors();
  virtual void DecrementLazilyDisplayErrors();

  // Calls `function` and returns its result; an exception of any type is caught and
  // the result is then 1. An empty function throws boost::bad_function_call.
  virtual long ExecuteFunctionWithTopLevelExceptionHandler(boost::function0<long> function);

  // A reporter made in a block of the small-block allocator, registered for the
  // calling thread. Throws std::bad_alloc ("bad allocation") when no block can be had.
  virtual boost::intrusive_ptr<DeferredErrorReporter> NewDeferredErrorReporter(
      bool reportWhenFinished);

  // The installed manager. With none installed: null when `allowNull`, else throws
  // std::logic_error "kel::config::ErrorManager not initialized. Check
  // kel/config/Errors.".
  static ErrorManager* Get(bool allowNull = false);
  // Installs `manager` (not owned; null uninstalls).
  static void Set(ErrorManager* manager);

  // The entry point of ThrowError. If deferral is allowed and the calling thread has a
  // live reporter, the error is recorded in the oldest one (level, key, component,
  // error number and the four values replace what it held; its error count goes up by
  // one). Then, in every case, DoThrowError is called with all nine arguments, outside
  // the lock.
  void ThrowErrorDispatch(ErrorLevel level, const char* key, unsigned long component,
                          long errorNumber, bool deferralAllowed, const ReplacementValue& value1,
                          const ReplacementValue& value2, const ReplacementValue& value3,
                          const ReplacementValue& value4);

  // True when the calling thread has at least one live reporter.
  bool IsErrorReportingDeferred();

 protected:
  // The host's raise operation: throw the host's exception for this error, or return
  // when the error is being deferred (see IsCurrentErrorRecorded). Called by
  // ThrowErrorDispatch and by DeferredErrorReporter::Finish.
  virtual void DoThrowError(ErrorLevel level, const char* key, unsigned long component,
                            long errorNumber, bool deferralAllowed, const ReplacementValue& value1,
                            const ReplacementValue& value2, const ReplacementValue& value3,
                            const ReplacementValue& value4) = 0;

  // True while DoThrowError runs on this thread for an error that ThrowErrorDispatch
  // has just recorded in a deferred reporter: the manager may return instead of
  // throwing, as the reporter will raise it when finished. False when the call comes
  // from DeferredErrorReporter::Finish or when nothing was recorded. Costs no lookup.
  static bool IsCurrentErrorRecorded();

  // Appends `reporter` to the calling thread's list (creating the thread's entry).
  void AddDeferredErrorReporter(DeferredErrorReporter* reporter);
  // Removes `reporter` from the list of the thread that registered it, and that
  // thread's entry once its list is empty. A reporter not registered here is ignored.
  void RemoveDeferredErrorReporter(DeferredErrorReporter* reporter);
  // The calling thread's oldest live reporter, or null.
  DeferredErrorReporter* GetCurrentErrorReporterForThisThread();

 private:
  friend class DeferredErrorReporter;

  using ReporterList = utility::SmallBlockAllocator::vector<DeferredErrorReporter*>;

  // The oldest live reporter of thread `threadId`, or null; one lookup under the lock.
  // Inline so that raising an error pays for the lookup and nothing more.
  DeferredErrorReporter* FindReporter(std::uint32_t threadId) {
    const std::lock_guard<std::recursive_mutex> lock(mutex_);
    const auto entry = reporters_.find(threadId);
    return entry == reporters_.end() ? nullptr : entry->second.front();
  }

  std::recursive_mutex mutex_;
  utility::SmallBlockAllocator::map<std::uint32_t, ReporterList> reporters_;

  static ErrorManager* S_managerP;
};

// A scope during which a failed operator new asks the installed manager to free
// memory: the constructor installs the library's handler with std::set_new_handler,
// the destructor installs none. The handler calls Get(false)->PurgeMemory(0) and
// returns when it answers true (the allocation is retried), throws std::bad_alloc
// when it answers false, and throws the "not initialized" std::logic_error when no
// manager is installed. The new-handler is process-wide: keep one initializer at a
// time, normally around the host's main function.
class KELCORE_API ErrorManager::NewHandlerInitializer {
 public:
  NewHandlerInitializer();
  ~NewHandlerInitializer();
  NewHandlerInitializer(const NewHandlerInitializer&) = delete;
  NewHandlerInitializer& operator=(const NewHandlerInitializer&) = delete;
};

}  // namespace kelcore::config
