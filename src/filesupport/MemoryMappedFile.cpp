#include <kelcore/config/ErrorManager.h>
#include <kelcore/filesupport/MemoryMappedFile.h>

#include <stdexcept>

#if defined(_WIN32)
#include "win/MemoryMappedFile.inc"
#else
#include "posix/MemoryMappedFile.inc"
#endif

namespace kelcore {

namespace {
constexpr unsigned long long kSizeLimit = 0x100000000ULL;
}  // namespace

MemoryMappedFile::MemoryMappedFile() = default;
MemoryMappedFile::MemoryMappedFile(const MemoryMappedFile&) = default;
MemoryMappedFile& MemoryMappedFile::operator=(const MemoryMappedFile&) = default;

MemoryMappedFile::~MemoryMappedFile() {
  Reset();
  name_.clear();
}

bool MemoryMappedFile::Open(const std::string& name, unsigned long long size, unsigned long flags) {
  if (size >= kSizeLimit) throw std::length_error("MemoryMappedFile: size must be below 4 GiB");
  Reset();
  name_ = name;
  size_ = size;
  flags_ = static_cast<std::uint32_t>(flags) & ~(kCreatedBlock | kReadWriteView);
  if (Open()) return true;
  Reset();
  if ((flags_ & kMapNow) != 0) {
    if (config::ErrorManager* manager = config::ErrorManager::Get(true)) {
      // Perhaps the system lacked memory: let the host free some, then try once more.
      manager->PurgeMemory(static_cast<unsigned int>(size_ & 0xFFFFFFFFu));
      if (Open()) return true;
    }
  }
  Reset();
  return false;
}

void MemoryMappedFile::Init(const std::string& name, unsigned long long size, unsigned long flags) {
  if (!Open(name, size, flags)) throw kMappingError;
}

bool MemoryMappedFile::Open() {
  const bool writable = (flags_ & (kWrite | kWriteNoReopen)) != 0;
  if ((flags_ & kCreate) != 0) {
    // An existing block is opened instead of created; that leaves kCreatedBlock clear.
    bool created = false;
    handle_ = detail::CreateSharedBlock(name_, static_cast<std::uint32_t>(size_), created);
    if (created) flags_ |= kCreatedBlock;
  }
  if (!handle_) handle_ = detail::OpenSharedBlock(name_);
  if (writable && handle_) flags_ |= kReadWriteView;
  if ((flags_ & kWriteNoReopen) == 0 && !handle_) handle_ = detail::OpenSharedBlock(name_);
  if (!handle_) return false;
  return (flags_ & kMapNow) != 0 ? MapView() : true;
}

void MemoryMappedFile::Init() {
  if (!Open()) throw kMappingError;
}

bool MemoryMappedFile::MapView() {
  if (!handle_) handle_ = detail::OpenSharedBlock(name_);
  if (!view_ && handle_) {
    unsigned long long length = size_;
    view_ = detail::MapSharedBlock(*handle_, length, (flags_ & kReadWriteView) != 0);
    if (view_ && size_ == 0) size_ = length;
  }
  return view_ != nullptr;
}

void* MemoryMappedFile::GetAddress() {
  if (!MapView()) throw kMappingError;
  return detail::ViewAddress(*view_);
}

bool MemoryMappedFile::MappedMemoryIsWritable() const {
  return view_ != nullptr && (flags_ & kReadWriteView) != 0;
}

unsigned long long MemoryMappedFile::Size() const {
  return size_;
}

void MemoryMappedFile::GetName(std::string& name) const {
  name = name_;
}

std::uint32_t MemoryMappedFile::Flags() const {
  return flags_;
}

bool MemoryMappedFile::Created() const {
  return (flags_ & kCreatedBlock) != 0;
}

void MemoryMappedFile::UnmapMemory() {
  view_.reset();
}

void MemoryMappedFile::CloseFileHandleIfPossible() {
  view_.reset();
}

void MemoryMappedFile::Reset() {
  view_.reset();
  handle_.reset();
  ClearKeptBits();
}

void MemoryMappedFile::ClearKeptBits() {
  flags_ %= kCreatedBlock;
}

}  // namespace kelcore
