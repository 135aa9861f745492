// A named block of shared memory that cooperating processes map at the same time.
//
// One process creates the block under a name and a size, others open it by name, and each
// maps a view of it. The block lives in memory (on POSIX a shm_open object "/" + name),
// not in a file on disk. Access is not synchronised: users coordinate among themselves.
// One object is used by one thread.
//
// Flags given to Open/Init:
//   kCreate (0x1)        create the block; when the name exists already, open that block
//                        instead (then Created() is false)
//   kWrite (0x10)        map the view for reading and writing (read-only otherwise)
//   kWriteNoReopen (0x20) as kWrite, and do not try a second open by name when the first
//                        attempt found nothing
//   kMapNow (0x8)        map the view during Open; a failed Open then asks the error
//                        manager to free memory (PurgeMemory with the size's low 32 bits)
//                        and tries once more
// Bits the object keeps in its flag word (callers' values for them are ignored):
//   kCreatedBlock (0x40000000)  this object created the block
//   kReadWriteView (0x80000000) the view is (to be) mapped for read and write
//
// Failures: Open returns false; Init and GetAddress throw the `long` 9002 as the
// exception object; a size of 4 GiB or more throws std::length_error before anything
// is released. No localized message is produced.
//
// Names and lifetime on POSIX:
// - A name must be a valid file name without "/" (at most 255 bytes); others fail.
// - The block is created with mode 0600, so other users cannot open it.
// - Every object holding the block keeps a shared flock on it. The holder that releases it
//   last (Reset, destructor, or exit of its process) removes the name (shm_unlink), as the
//   system removes a named mapping with its last handle on Windows. An opener that finds
//   the name removed under it starts over, so it never gets a block that has lost its name.
// - A process killed while it held a block leaves the name behind with no holder. The next
//   Open finds it: creating falls back to opening it (kCreatedBlock stays clear), and that
//   object, as the block's only holder, removes the name when it releases it.
// - Creating and setting the size happen under an exclusive flock, so openers wait for a
//   creator instead of seeing a half-made block; an opener that meets a block of size 0
//   whose creator has not even taken that lock yet waits up to about 50 ms for it.
// - The view covers `size` bytes; with size 0 it covers the whole block and Size() then
//   reports the block's size. An existing block smaller than the requested size (a stale
//   block made with another size, or one whose creator has not set its size yet) is not
//   mapped: the view fails instead of being mapped past the block's end. An existing block
//   is never resized.
//
// Copies share the mapping handle and the view with the original; each is released when
// the last object referring to it lets go of it (so copies never release twice).
#pragma once

#include <kelcore/Export.h>

#include <cstdint>
#include <memory>
#include <string>

namespace kelcore {

namespace detail {
class SharedBlockHandle;
class SharedBlockView;
}  // namespace detail

class KELCORE_API MemoryMappedFile {
 public:
  static constexpr unsigned long kCreate = 0x1;
  static constexpr unsigned long kMapNow = 0x8;
  static constexpr unsigned long kWrite = 0x10;
  static constexpr unsigned long kWriteNoReopen = 0x20;
  static constexpr std::uint32_t kCreatedBlock = 0x40000000;
  static constexpr std::uint32_t kReadWriteView = 0x80000000;
  // The exception object of Init and GetAddress.
  static constexpr long kMappingError = 9002;

  MemoryMappedFile();
  MemoryMappedFile(const MemoryMappedFile&);
  MemoryMappedFile& operator=(const MemoryMappedFile&);
  virtual ~MemoryMappedFile();

  // Releases what the object held, stores the arguments and opens the block (see above).
  // Only the low 32 bits of `flags` are kept.
  bool Open(const std::string& name, unsigned long long size, unsigned long flags);
  // As Open; failure throws the long 9002.
  void Init(const std::string& name, unsigned long long size, unsigned long flags);

  // The view, mapped first when necessary (opening the block by name again if the object
  // holds no handle); throws the long 9002 when there is still no view.
  void* GetAddress();
  // A view exists and it is mapped for read and write.
  bool MappedMemoryIsWritable() const;
  unsigned long long Size() const;
  void GetName(std::string& name) const;
  // The flag word, with the kept bits.
  std::uint32_t Flags() const;
  // This object created the block (kCreatedBlock).
  bool Created() const;

  // Both unmap the view only; the handle stays open, so GetAddress maps the block again.
  void UnmapMemory();
  void CloseFileHandleIfPossible();
  // Unmaps, releases the handle and clears the kept bits; name and size stay.
  void Reset();

 protected:
  // The same on the stored name, size and flags. Open() neither releases first nor
  // retries.
  bool Open();
  void Init();

 private:
  bool MapView();
  void ClearKeptBits();

  std::shared_ptr<detail::SharedBlockHandle> handle_;
  std::string name_;
  unsigned long long size_ = 0;
  std::shared_ptr<detail::SharedBlockView> view_;
  std::uint32_t flags_ = 0;
};

}  // namespace kelcore
