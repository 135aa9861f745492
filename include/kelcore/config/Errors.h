// Raising errors that the user may see.
//
// Library code never builds user-visible error text and never picks the exception type
// that reaches the application. It calls ThrowError with a severity, a localization key
// (a narrow 7-bit string "$$$/" + a path of names + "=" + the default English text,
// with placeholders "^1" to "^4"), a component number, an error number and up to four
// replacement values. The call goes to the error manager the host installed
// (kelcore::config::ErrorManager), which formats the message with
// SubstituteErrorMessage and throws the host's own exception, or records the error in
// the calling thread's deferred error reporter and returns.
//
// Component numbers of the library's own errors: 100 configuration, 104 property
// lists, 105 utility, 107 geometry, 109 relative aliases.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/ReplacementValue.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::config {

enum ErrorLevel : std::int32_t {
  kErrorLevelFatal = 0,
  kErrorLevelNonFatal = 1,
};

// Raises an error through the installed manager's ThrowErrorDispatch, arguments
// unchanged. With no manager installed it throws std::logic_error
// "kel::config::ErrorManager not initialized. Check kel/config/Errors." and records
// nothing. Returns only when the manager chose not to throw (deferred reporting). Any
// thread.
KELCORE_API void ThrowError(ErrorLevel level, const char* key, unsigned long component,
                            long errorNumber, bool deferralAllowed,
                            const ReplacementValue& value1 = ReplacementValue(),
                            const ReplacementValue& value2 = ReplacementValue(),
                            const ReplacementValue& value3 = ReplacementValue(),
                            const ReplacementValue& value4 = ReplacementValue());

// The installed localizer's text for `key` with "^1" to "^4" filled in, in that order:
// for each value whose kind is not none, the first occurrence of its placeholder in the
// text as it stands is replaced by ReplacementValue::Format(); later occurrences stay.
// Because the replacements run one after the other, a string value holding "^2", "^3"
// or "^4" has that placeholder filled by the later value. A placeholder that is
// missing leaves its value unused; a value of kind none leaves its placeholder in the
// text. With no localizer installed it throws std::logic_error
// "kelcore::config::Localizer not initialized. Check kelcore/config/Localizer.".
KELCORE_API UTF16String SubstituteErrorMessage(const char* key, const ReplacementValue& value1,
                                               const ReplacementValue& value2,
                                               const ReplacementValue& value3,
                                               const ReplacementValue& value4);

// Raises the configuration self-test error, deferral allowed. Fatal: component 100,
// error 21, "This is a fatal exception.". Non-fatal: component 100, error 20, with the
// values -2147483648, 4294967295 and 29.2334, whose message reads "This is a non-fatal
// exception. int:-2147483648, uint:4294967295, double:29.2334".
KELCORE_API void TestThrowError(bool fatal);

}  // namespace kelcore::config
