#include "debug/TraceManager.h"

#include "debug/TraceDatabaseText.h"

#include <algorithm>
#include <limits>

namespace kelcore::debug {

namespace {

using proplist::PropList;

const UTF8String kMasterName = reinterpret_cast<const unsigned char*>("Master");
const UTF8String kEnabledKey = reinterpret_cast<const unsigned char*>("Enabled");
const UTF8String kVolumeKey = reinterpret_cast<const unsigned char*>("Volume");
constexpr bool kDefaultEnabled = true;
constexpr std::int32_t kDefaultVolume = 5;
constexpr bool kDefaultMasterEnabled = true;
constexpr std::int32_t kDefaultMasterVolume = 10;

std::int32_t ClampVolume(long volume) {
  return static_cast<std::int32_t>(std::clamp<long>(
      volume, std::numeric_limits<std::int32_t>::min(), std::numeric_limits<std::int32_t>::max()));
}

// Clears the re-entrancy flag when the locked test ends, however it ends.
class TestUnderWay {
 public:
  explicit TestUnderWay(std::atomic<bool>& flag) : flag_(flag) {
    flag_.store(true, std::memory_order_relaxed);
  }
  ~TestUnderWay() { flag_.store(false, std::memory_order_relaxed); }
  TestUnderWay(const TestUnderWay&) = delete;
  TestUnderWay& operator=(const TestUnderWay&) = delete;

 private:
  std::atomic<bool>& flag_;
};

}  // namespace

TraceManager& TraceManager::Get() {
  static TraceManager* const manager = new TraceManager(MakeTraceDatabaseFileStore());
  return *manager;
}

TraceManager::TraceManager(std::unique_ptr<TraceDatabaseStore> store) : store_(std::move(store)) {}

bool TraceManager::Enabled(const unsigned char* category, long volume, bool createIfMissing) {
  if (!testUnderWay_.load(std::memory_order_relaxed)) {
    TraceDecisionInputs in;
    if (cache_.Find(category, epoch_.load(std::memory_order_acquire), in)) {
      if (!in.masterEnabled || volume > in.masterVolume) return false;
      // An absent category that is to be created needs the locked path.
      if (in.stored || !createIfMissing) return in.enabled && volume <= in.volume;
    }
  }
  std::lock_guard<std::recursive_mutex> hold(lock_);
  return EnabledLocked(category, volume, createIfMissing);
}

bool TraceManager::EnabledLocked(const unsigned char* category, long volume, bool createIfMissing) {
  if (testUnderWay_.load(std::memory_order_relaxed)) return false;
  TestUnderWay underWay(testUnderWay_);
  FillMasterCache();
  const UTF8String name(category);
  const bool masterPasses = masterEnabled_ && volume <= masterVolume_;
  // The category is looked up even when the master rejects, to fill the cache; only a
  // test that passes the master may create it.
  const CategoryValues values = Lookup(name, createIfMissing && masterPasses);
  cache_.Store(category, epoch_.load(std::memory_order_relaxed),
               TraceDecisionInputs{masterEnabled_, masterVolume_, values.stored, values.enabled,
                                   values.volume});
  return masterPasses && values.enabled && volume <= values.volume;
}

long TraceManager::GetVolume(const unsigned char* category) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  return Lookup(UTF8String(category), true).volume;
}

void TraceManager::SetVolume(const unsigned char* category, long volume) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  const UTF8String name(category);
  StoreCategory(name, Lookup(name, false).enabled, ClampVolume(volume));
}

long TraceManager::GetMasterVolume() {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  FillMasterCache();
  return masterVolume_;
}

void TraceManager::SetMasterVolume(long volume) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  const CategoryValues master = Lookup(kMasterName, false);
  const std::int32_t stored = ClampVolume(volume);
  StoreCategory(kMasterName, master.enabled, stored);
  masterEnabled_ = master.enabled;
  masterVolume_ = stored;
  masterCached_ = true;
  RaiseEpoch();
}

void TraceManager::GetCategories(std::list<UTF8String>& categories) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  Database().GetPropertyNames(categories);
}

void TraceManager::GetAsString(UTF8String& text) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  UTF8String result;
  const PropList& database = Database();
  for (const PropList::Property& property : database) {
    const PropList* record = database.GetSubList(property.key);
    if (record == nullptr) continue;
    bool enabled = kDefaultEnabled;
    std::int32_t volume = kDefaultVolume;
    record->GetValue(kEnabledKey, enabled);
    record->GetValue(kVolumeKey, volume);
    AppendTraceRecord(result, property.key, enabled, volume);
  }
  text.swap(result);
}

void TraceManager::SetFromString(const UTF8String& text) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  changeCount_.fetch_add(1, std::memory_order_release);
  MergeText(text);
  RaiseEpoch();
  Save();
}

void TraceManager::Shutdown() {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  if (!database_) return;
  Save();
  database_.reset();
  masterCached_ = false;
  RaiseEpoch();
}

bool TraceManager::FileWritesDisabled() const {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  return fileWritesDisabled_;
}

void TraceManager::SetFileWritesDisabled(bool disabled) {
  std::lock_guard<std::recursive_mutex> hold(lock_);
  fileWritesDisabled_ = disabled;
}

PropList& TraceManager::Database() {
  if (!database_) {
    database_ = std::make_unique<PropList>();
    MergeText(store_->Read());
    RaiseEpoch();
  }
  return *database_;
}

void TraceManager::FillMasterCache() {
  if (masterCached_) return;
  const CategoryValues master = Lookup(kMasterName, false);
  masterEnabled_ = master.stored ? master.enabled : kDefaultMasterEnabled;
  masterVolume_ = master.stored ? master.volume : kDefaultMasterVolume;
  masterCached_ = true;
}

TraceManager::CategoryValues TraceManager::Lookup(const UTF8String& name, bool createIfMissing) {
  const bool master = name == kMasterName;
  CategoryValues values{false, master ? kDefaultMasterEnabled : kDefaultEnabled,
                        master ? kDefaultMasterVolume : kDefaultVolume};
  if (const PropList* record = Database().GetSubList(name)) {
    values.stored = true;
    record->GetValue(kEnabledKey, values.enabled);
    record->GetValue(kVolumeKey, values.volume);
  } else if (createIfMissing) {
    StoreCategory(name, values.enabled, values.volume);
    values.stored = true;
  }
  return values;
}

void TraceManager::StoreCategory(const UTF8String& name, bool enabled, std::int32_t volume) {
  changeCount_.fetch_add(1, std::memory_order_release);
  PropList& database = Database();
  database.RemoveValue(name);
  PropList* record = database.NewSubList(name);
  record->SetValue(kEnabledKey, enabled);
  record->SetValue(kVolumeKey, volume);
  RaiseEpoch();
  Save();
}

void TraceManager::MergeText(const UTF8String& text) {
  PropList& database = Database();
  for (const TraceRecord& parsed : ParseTraceRecords(text)) {
    PropList* record = database.NewSubList(parsed.name);
    record->SetValue(kEnabledKey, parsed.enabled);
    record->SetValue(kVolumeKey, parsed.volume);
  }
}

void TraceManager::Save() {
  if (fileWritesDisabled_ || !database_) return;
  UTF8String text;
  GetAsString(text);
  store_->Write(text);
}

}  // namespace kelcore::debug
