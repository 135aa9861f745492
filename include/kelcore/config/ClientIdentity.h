// Who the host application is: its names, versions, build number and preferences
// directory, as it tells the library at start-up.
//
// Each value is a UTF16String with a flag recording whether it was set; all are empty
// and unset when the library loads. The library uses them to name folders and files
// and never invents them, except for the fallbacks below.
//
// Threads: the values are unsynchronised. The host sets them once on its main thread
// before other threads use the library; afterwards they are only read. A reference
// returned by a getter stays valid until the value is set again.
//
// Suite labels: the host family's product label is "VS". GetSuiteClientVersion
// returns "VS" while no suite version was set, and GetSuiteClientVersion_NumberOnly
// removes a leading "VS" from a set suite version ("VS7" gives "7.0").
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::config {

// Each setter stores a copy of `value` (a value assigned to itself is left alone) and
// sets the value's flag.
KELCORE_API void SetClientName(const UTF16String& value);
KELCORE_API void SetApplicationName(const UTF16String& value);
KELCORE_API void SetClientVersion(const UTF16String& value);
KELCORE_API void SetClientInternalVersion(const UTF16String& value);
KELCORE_API void SetClientBuildNumber(const UTF16String& value);
KELCORE_API void SetCompanyName(const UTF16String& value);
KELCORE_API void SetClientPrefsDir(const UTF16String& value);
KELCORE_API void SetClientSuiteVersion(const UTF16String& value);

// The stored values; empty while never set.
KELCORE_API const UTF16String& GetClientName();
// The application name once SetApplicationName was called (even an empty one), the
// client name until then.
KELCORE_API const UTF16String& GetApplicationName();
KELCORE_API const UTF16String& GetClientVersion();
KELCORE_API const UTF16String& GetClientInternalVersion();
KELCORE_API const UTF16String& GetClientBuildNumber();
KELCORE_API const UTF16String& GetCompanyName();
KELCORE_API const UTF16String& GetClientPrefsDir();

// Whether SetClientName was called.
KELCORE_API bool IsClientNameInitialized();

// The operating system: "Windows" on Windows; elsewhere the kernel's name as uname
// reports it ("Linux" on Linux).
KELCORE_API UTF16String GetClientPlatform();

// The suite version when set, else "VS".
KELCORE_API UTF16String GetSuiteClientVersion();

// When the suite version was set: that version without a leading "VS", with ".0"
// appended when what remains holds no "." ("VS7" and "7" give "7.0", "7.1" stays).
// When it was not set: the client version unchanged.
KELCORE_API UTF16String GetSuiteClientVersion_NumberOnly();

// Company name, " ", client name, " ", GetSuiteClientVersion(), " (",
// GetClientPlatform(), ")".
KELCORE_API UTF16String GetSuiteClientName();

// The library's own version, "2.0.0.420171".
KELCORE_API UTF16String GetVersionString();

// Returns every value to its load-time state (empty and unset), for a host that sets
// itself up again and for tests. Same threading rule as the setters.
KELCORE_API void ResetClientIdentity();

}  // namespace kelcore::config
