// The error manager for hosts that have none of their own.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/ErrorManager.h>

namespace kelcore::config {

// Throws kelcore::config::LocalizedError for every error, its message built with
// SubstituteErrorMessage (so a localizer must be installed, e.g.
// kelcore::config::DefaultLocalizer). An error raised with deferral allowed while the
// thread has a deferred error reporter is only recorded there: DoThrowError returns,
// and the reporter's Finish raises it later. Everything else is the base class's.
//
//   DefaultLocalizer localizer;   DefaultErrorManager manager;
//   Localizer::Set(&localizer);   ErrorManager::Set(&manager);
class KELCORE_API DefaultErrorManager : public ErrorManager {
 public:
  DefaultErrorManager();
  ~DefaultErrorManager() override;

 protected:
  void DoThrowError(ErrorLevel level, const char* key, unsigned long component, long errorNumber,
                    bool deferralAllowed, const ReplacementValue& value1,
                    const ReplacementValue& value2, const ReplacementValue& value3,
                    const ReplacementValue& value4) override;
};

}  // namespace kelcore::config
