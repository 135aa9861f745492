// The intern table behind ImmutableString: lookup, the last drop, and the purge.
#include <kelcore/utility/ImmutableString.h>

#include <kelcore/threads/RecursiveMutex.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include "utility/ImmutableStringMap.h"

#include <cstring>
#include <new>
#include <stdexcept>

namespace kelcore::utility {

namespace {

using Record = ImmutableString::InternalRepresentation;

constexpr std::size_t kBucketCount = 64;
constexpr std::size_t kMaxLength = 0xFFFFFFFFu - 64;

enum TableState { kUnborn, kLive, kGone };
// Trivially destructible, so it still answers while and after the table is destroyed.
constinit std::atomic<int> gTableState{kUnborn};

unsigned int RecordSize(const Record* record) {
  return record->dynamic ? ImmutableString::kHeaderSize + record->length + 1
                         : ImmutableString::kHeaderSize;
}

void DisposeRecord(Record* record) noexcept {
  SmallBlockAllocator::Dispose(record, RecordSize(record));
}

// Throws std::bad_alloc.
Record* NewRecord(const unsigned char* text, std::uint32_t length, bool dynamic,
                  std::uint8_t bucket) {
  const unsigned int size =
      dynamic ? ImmutableString::kHeaderSize + length + 1 : ImmutableString::kHeaderSize;
  void* block = SmallBlockAllocator::Allocate(size);
  auto* record = new (block) Record{{0}, length, text, nullptr, dynamic, false, bucket};
  if (dynamic) {
    auto* copy = static_cast<unsigned char*>(block) + ImmutableString::kHeaderSize;
    std::memcpy(copy, text, length);
    copy[length] = 0;
    record->data = copy;
  }
  return record;
}

struct alignas(64) Bucket {
  threads::RecursiveMutex mutex;
  ImmutableStringMap live;
  Record* expired = nullptr;  // linked through nextExpired
};

class Table {
 public:
  // Null once the table has been destroyed at exit.
  static Table* Instance() {
    static Table table;
    return gTableState.load(std::memory_order_acquire) == kLive ? &table : nullptr;
  }

  Table() { gTableState.store(kLive, std::memory_order_release); }

  // Frees the dynamic texts nobody holds; see the header on what outlives the table.
  ~Table() {
    gTableState.store(kGone, std::memory_order_release);
    for (Bucket& bucket : buckets_) {
      bucket.live.ForEach([](Record* record) {
        if (record->dynamic && record->referenceCount.load(std::memory_order_acquire) == 0) {
          DisposeRecord(record);
        }
      });
    }
  }

  Bucket& operator[](std::size_t index) { return buckets_[index]; }

 private:
  Bucket buckets_[kBucketCount];
};

std::uint8_t BucketIndex(const unsigned char* text, std::size_t length) {
  return static_cast<std::uint8_t>((std::size_t{text[length - 1]} + text[length * 2 / 3] + length) %
                                   kBucketCount);
}

}  // namespace

ImmutableString ImmutableString::LookupOrCreate(const unsigned char* text, std::size_t length,
                                                bool dynamic) {
  if (text == nullptr || length == 0) return ImmutableString();
  if (length > kMaxLength) throw std::length_error("ImmutableString: text too long");
  const auto size = static_cast<std::uint32_t>(length);
  const std::uint8_t index = BucketIndex(text, length);
  Table* table = Table::Instance();
  if (table == nullptr) {
    try {
      return ImmutableString(NewRecord(text, size, true, index));
    } catch (const std::bad_alloc&) {
      return ImmutableString();
    }
  }
  Bucket& bucket = (*table)[index];
  threads::RecursiveMutex::ScopedLock hold(bucket.mutex,
                                           "ImmutableString::LookupOrCreateRepresentation");
  const std::uint32_t hash = ImmutableStringMap::Hash(text, length);
  if (Record* found = bucket.live.Find(text, size, hash)) return ImmutableString(found);
  Record* record;
  try {
    bucket.live.Reserve();
    record = NewRecord(text, size, dynamic, index);
  } catch (const std::bad_alloc&) {
    return ImmutableString();
  }
  bucket.live.Insert(record, hash);
  return ImmutableString(record);
}

void ImmutableString::ReleaseLast(InternalRepresentation* record) noexcept {
  Table* table = Table::Instance();
  if (table == nullptr) {
    if (record->referenceCount.fetch_sub(1, std::memory_order_acq_rel) == 1) {
      DisposeRecord(record);
    }
    return;
  }
  Bucket& bucket = (*table)[record->bucket];
  threads::RecursiveMutex::ScopedLock hold(bucket.mutex, "ImmutableString::ExpireRepresentation");
  if (record->referenceCount.fetch_sub(1, std::memory_order_acq_rel) == 1 &&
      !record->onExpiredList) {
    record->onExpiredList = true;
    record->nextExpired = bucket.expired;
    bucket.expired = record;
  }
}

bool ImmutableString::PurgeUnusedStrings() {
  Table* table = Table::Instance();
  if (table == nullptr) return false;
  bool freed = false;
  for (std::size_t i = 0; i < kBucketCount; ++i) {
    Bucket& bucket = (*table)[i];
    threads::RecursiveMutex::ScopedLock hold(bucket.mutex, "ImmutableString::DoPurge");
    Record* record = bucket.expired;
    bucket.expired = nullptr;
    while (record != nullptr) {
      Record* next = record->nextExpired;
      record->nextExpired = nullptr;
      record->onExpiredList = false;
      if (record->dynamic && record->referenceCount.load(std::memory_order_acquire) == 0) {
        bucket.live.Remove(record);
        DisposeRecord(record);
        freed = true;
      }
      record = next;
    }
  }
  return freed;
}

}  // namespace kelcore::utility
