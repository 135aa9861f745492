#include <kelcore/debug/DebugDatabase.h>

#include "debug/DebugDatabaseText.h"

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/FileUtils.h>

namespace kelcore::debug {

namespace {

filesupport::File DatabaseFile() {
  return filesupport::File(filesupport::Dir::PrefDir(), u"Debug Database.txt");
}

}  // namespace

const unsigned char DebugDatabase::kTrueText[] = "true";
const unsigned char DebugDatabase::kFalseText[] = "false";

DebugDatabase& DebugDatabase::Instance() {
  static DebugDatabase instance;
  return instance;
}

DebugDatabase::DebugDatabase() {
  Load();
}

DebugDatabase::~DebugDatabase() {
  std::lock_guard<std::mutex> hold(lock_);
  if (unsaved_) SaveLocked();
}

void DebugDatabase::Load() {
  UTF8String text;
  try {
    const filesupport::File file = DatabaseFile();
    if (!file.Exists()) return;
    utility::FileUtils::SimpleReadFileToString(file, text);
  } catch (...) {
    return;  // no preferences directory or an unreadable file: no switches
  }
  for (DebugDatabaseLine& line : ParseDebugDatabaseText(text)) {
    entries_[std::move(line.key)] = Entry{std::move(line.value), std::move(line.defaultValue)};
  }
}

UTF8String DebugDatabase::GetEntry(const UTF8String& key) {
  std::lock_guard<std::mutex> hold(lock_);
  const auto found = entries_.find(key);
  return found == entries_.end() ? UTF8String() : found->second.value;
}

UTF8String DebugDatabase::GetEntry(const UTF8String& key, const UTF8String& defaultValue) {
  std::lock_guard<std::mutex> hold(lock_);
  const auto [entry, created] = entries_.try_emplace(key, Entry{defaultValue, defaultValue});
  if (created || entry->second.defaultValue != defaultValue) {
    entry->second.defaultValue = defaultValue;
    unsaved_ = true;
  }
  return entry->second.value;
}

bool DebugDatabase::GetBoolEntry(const UTF8String& key, bool defaultValue) {
  return GetEntry(key, defaultValue ? kTrueText : kFalseText) == kTrueText;
}

void DebugDatabase::SetEntry(const UTF8String& key, const UTF8String& value) {
  std::lock_guard<std::mutex> hold(lock_);
  entries_[key].value = value;
  unsaved_ = true;
}

bool DebugDatabase::HasEntry(const UTF8String& key) const {
  std::lock_guard<std::mutex> hold(lock_);
  return entries_.count(key) != 0;
}

void DebugDatabase::RemoveEntry(const UTF8String& key) {
  std::lock_guard<std::mutex> hold(lock_);
  if (entries_.erase(key) != 0) unsaved_ = true;
}

void DebugDatabase::GetDebugKeys(std::list<UTF8String>& keys) const {
  std::lock_guard<std::mutex> hold(lock_);
  keys.clear();
  for (const auto& entry : entries_) keys.push_back(entry.first);
}

void DebugDatabase::Clear() {
  std::lock_guard<std::mutex> hold(lock_);
  entries_.clear();
  unsaved_ = false;
  // Saving never writes an empty database, so the file goes too: otherwise the cleared
  // switches would come back at the next start.
  if (fileWritesDisabled_) return;
  try {
    filesupport::File file = DatabaseFile();
    if (file.Exists()) file.Delete();
  } catch (...) {
    // A developer aid: a file that cannot be removed must not break the host.
  }
}

void DebugDatabase::SaveDataBase() const {
  std::lock_guard<std::mutex> hold(lock_);
  SaveLocked();
}

bool DebugDatabase::GetFileWritesDisabled() const {
  std::lock_guard<std::mutex> hold(lock_);
  return fileWritesDisabled_;
}

void DebugDatabase::SetFileWritesDisabled(bool disabled) {
  std::lock_guard<std::mutex> hold(lock_);
  fileWritesDisabled_ = disabled;
}

void DebugDatabase::SaveLocked() const {
  if (fileWritesDisabled_ || entries_.empty()) return;
  UTF8String text;
  for (const auto& [key, entry] : entries_) {
    AppendDebugDatabaseLine(text, key, entry.value, entry.defaultValue);
  }
  try {
    utility::FileUtils::SimpleWriteStringToFile(DatabaseFile(), text);
    unsaved_ = false;
  } catch (...) {
    // A developer aid: a file that cannot be written must not break the host.
  }
}

}  // namespace kelcore::debug
