// Tracing by category and volume, and the trace database that holds the settings.
//
// Code that traces asks first whether a message would be emitted, then emits it:
//
//   if (kelcore::debug::TraceEnabled(u8"FileIO", 3, true)) kelcore::debug::Trace(text);
//
// Categories are named by NUL-terminated UTF-8 text. Each has an Enabled switch and a
// volume; the reserved category "Master" switches and limits everything. A message of
// volume v is emitted when Master is enabled with v <= its volume and the category is
// enabled with v <= its volume. Larger volumes mean more detail; 0 is the most
// important. Absent categories have the defaults Enabled = true, Volume = 5 (Master:
// true, 10).
//
// The trace database is loaded on first use from "Trace Database.txt" in the preferences
// directory and written back there after every stored change (unless file writes are
// disabled); ShutdownTraceManager writes it a last time and forgets it. A missing or
// unreadable file (or no preferences directory) gives an empty database; write failures
// are swallowed.
//
// The master's switch and volume in effect are read from the database once, at the first
// test after loading, and then changed only by SetMasterTraceVolume: a "Master" record
// changed through SetTraceVolume or SetTraceDatabaseFromString is stored (and saved) but
// takes effect after the next ShutdownTraceManager.
//
// Textual form (GetTraceDatabaseAsString, SetTraceDatabaseFromString and the file): one
// record per category, "name TAB enabled TAB volume LF", enabled written "1" or "0" and
// the volume in decimal with a leading '-' when negative, categories in database order
// (unsigned byte order of the names).
// The reader merges: categories it does not mention keep their settings, a category it
// names gets both values from its record. It reads a name up to the next TAB, an enabled
// field up to the next TAB and a volume up to the next LF; when the text ends inside any
// of the three (a last record without its LF included) that record is dropped and
// reading stops. Each numeric field is read as strtol reads base 10 in the "C" locale:
// leading white space, an optional sign, digits, the rest ignored; no digits gives 0.
// Enabled is true exactly when that number is 1 ("1", "+1", " 1", "01", "1x"; not "2",
// "true" or ""). The volume is clamped to the range of a 32-bit signed integer (a CR
// before the LF is ignored, so CR LF text reads). Junk never fails and never reads out of
// bounds; the worst it can do is create odd categories: a name runs to its TAB across
// any LFs ("junk LF Name TAB 1 TAB 4 LF" is one record named "junk LF Name"), and empty
// names are names like any other. Names holding TAB or LF do not survive the form; a
// name holding NUL is cut there.

// Thread safety: every function may be called from any thread. All database access is
// serialised by one process-wide recursive lock. TraceEnabled has a fast path that reads
// a per-category cache without that lock; see TraceEnabled. Trace itself takes no lock.
#pragma once

#include <list>

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::debug {

// Hands `text` (as a UTF8String) to the master trace handler, or to the built-in default
// handler when none is installed. No volume test is made here. A null `text` is
// ignored. Exceptions thrown by the handler reach the caller.
KELCORE_API void Trace(unsigned char const* text);

// True when a message of `volume` in `category` is to be emitted (see above). When
// `createIfMissing` is true an absent category is stored with the defaults (a change:
// the change counter rises and the file is written). While a test is already under way
// (for example because a lookup itself traces), the inner test answers false. A null
// category answers false.
//
// Memory ordering: the answer reflects every setter that completed (returned) before the
// call began on any thread; it is never stale with respect to such a change.
KELCORE_API bool TraceEnabled(unsigned char const* category, long volume, bool createIfMissing);

// The category's volume; an absent category is stored with the defaults first (a change).
KELCORE_API long GetTraceVolume(unsigned char const* category);

// Stores `volume` for the category, keeping its Enabled value (true if it was absent).
KELCORE_API void SetTraceVolume(unsigned char const* category, long volume);

// The same for "Master". Getting does not store an absent "Master"; setting stores it.
KELCORE_API long GetMasterTraceVolume();
KELCORE_API void SetMasterTraceVolume(long volume);

// Replaces `categories` with the names of all categories in the database ("Master"
// included when it is stored), in the database's order.
KELCORE_API void GetTraceCategories(std::list<UTF8String>& categories);

// The textual form described above: writes the whole database into `text`, or merges
// `text` into the database (the change counter rises by one per call, whatever the text
// holds, and the file is written).
KELCORE_API void GetTraceDatabaseAsString(UTF8String& text);
KELCORE_API void SetTraceDatabaseFromString(UTF8String const& text);

// A counter that rises with every change of the database; clients poll it to refresh
// decisions they cache. Starts at 0; read with acquire ordering.
KELCORE_API int TraceChangeCount();

// Writes a loaded database to its file (unless file writes are disabled), destroys it and
// forgets the master cache; the next use loads it again from the file.
KELCORE_API void ShutdownTraceManager();

// The process-wide switch that stops every write of "Trace Database.txt". Default false.
KELCORE_API bool GetDisableFileWrites();
KELCORE_API void SetDisableFileWrites(bool disable);

// Writes `text` to the debugger's output, only when a debugger is attached (on POSIX, a
// tracer shown in /proc/self/status; the text then goes to standard error). Otherwise
// does nothing. Null is ignored. Never throws.
KELCORE_API void DebugTrace(unsigned char const* text) noexcept;

}  // namespace kelcore::debug
