// DebugDatabase: the process-wide store of developer switches, kept in
// "Debug Database.txt" in the preferences directory.
//
// Each entry maps a key to its current value and its default value, all UTF8String.
// Boolean switches hold the texts "true" and "false" (kTrueText, kFalseText); a switch is
// on exactly when its value is "true".
//
// File format, written by SaveDataBase: one line per entry in key order (unsigned byte
// order), key TAB value TAB default CR LF. The reader is the inverse and forgiving, since
// developers edit the file by hand: lines end at LF, with one CR before it removed; a
// last line without its line end counts. The key runs to the first TAB and the default
// from the last TAB, the value is what lies between (so a value may itself hold TABs);
// a line with one TAB is a key and a value with an empty default; a line without a TAB
// (an empty line included) is ignored. A key seen twice keeps its last line. Keys and
// defaults holding TAB, CR or LF, and values holding CR or LF, do not survive a save and
// load. A missing or unreadable file, or one that cannot be had because the preferences
// directory cannot, gives an empty database.
//
// The file is read once, when Instance() first runs; its path is found again for each
// save (Dir::PrefDir() is computed on every call, so a host that sets its preferences
// directory late still gets its switches saved there). Saving happens when SaveDataBase
// is called and, for changes not saved yet, when the instance is destroyed at exit. Nothing is
// written while file writes are disabled or the database is empty; write failures are swallowed
// (the switches are a developer aid and must never break the host).
//
// Threads: every member takes the database's own lock; any thread may call any member.
// Instance() is made on first use (thread-safe) and lives until static destruction.
#pragma once

#include <list>
#include <map>
#include <mutex>

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::debug {

class KELCORE_API DebugDatabase {
 public:
  // The texts of boolean switches.
  static const unsigned char kTrueText[];   // "true"
  static const unsigned char kFalseText[];  // "false"

  // The process's database, loaded from its file on first use.
  static DebugDatabase& Instance();

  // The current value of `key`; empty when there is no such entry.
  UTF8String GetEntry(const UTF8String& key);
  // The current value of `key`, recording `defaultValue` as the entry's default. A key
  // that is absent is created with `defaultValue` as both value and default (so it shows
  // in the file, ready to be edited) and `defaultValue` is returned.
  UTF8String GetEntry(const UTF8String& key, const UTF8String& defaultValue);
  // GetEntry(key, "true" or "false") == "true".
  bool GetBoolEntry(const UTF8String& key, bool defaultValue);
  // Sets the current value; a new entry gets an empty default.
  void SetEntry(const UTF8String& key, const UTF8String& value);
  bool HasEntry(const UTF8String& key) const;
  // Removes the entry; nothing happens when there is none.
  void RemoveEntry(const UTF8String& key);
  // Replaces `keys` with every key in key order.
  void GetDebugKeys(std::list<UTF8String>& keys) const;
  // Removes every entry, and the file unless file writes are disabled (an empty
  // database is never written, so the file would otherwise bring the entries back).
  void Clear();
  // Writes the file (see above) unless file writes are disabled or there is no entry.
  void SaveDataBase() const;
  bool GetFileWritesDisabled() const;
  void SetFileWritesDisabled(bool disabled);

  // Saves changes that were not saved yet (see above).
  ~DebugDatabase();
  DebugDatabase(const DebugDatabase&) = delete;
  DebugDatabase& operator=(const DebugDatabase&) = delete;

 private:
  struct Entry {
    UTF8String value;
    UTF8String defaultValue;
  };

  DebugDatabase();
  void Load();
  void SaveLocked() const;

  mutable std::mutex lock_;
  std::map<UTF8String, Entry> entries_;
  bool fileWritesDisabled_ = false;
  mutable bool unsaved_ = false;
};

}  // namespace kelcore::debug
