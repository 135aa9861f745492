#include <kelcore/filesupport/ByteStream.h>

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>

namespace kelcore::filesupport {
namespace {

std::atomic<int> gNextExtensionIndex{0};

template <typename T>
T& GrowToIndex(std::vector<T>& words, int index) {
  if (index < 0) throw std::out_of_range("byte stream extension index is negative");
  const auto slot = static_cast<std::size_t>(index);
  if (slot >= words.size()) words.resize(slot + 1, T{});
  return words[slot];
}

[[noreturn]] void ProgramFault(const char* operation) {
  std::fprintf(stderr,
               "kelcore: %s called on an output stream that does not support it; aborting\n",
               operation);
  std::abort();
}

}  // namespace

ByteStream_base::~ByteStream_base() noexcept(false) {
  // A throwing callback ends the program even though this destructor may throw.
  [this]() noexcept {
    for (const auto& [fn, index] : callbacks_) fn(kEraseEvent, *this, index);
  }();
}

int ByteStream_base::xalloc() {
  return gNextExtensionIndex.fetch_add(1, std::memory_order_relaxed);
}

long& ByteStream_base::iword(int index) {
  return GrowToIndex(iwords_, index);
}

void*& ByteStream_base::pword(int index) {
  return GrowToIndex(pwords_, index);
}

void ByteStream_base::register_callback(event_callback fn, int index) {
  callbacks_.emplace_back(fn, index);
}

IByteStream::~IByteStream() = default;

void IByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  for (unsigned long i = 0; i < count; ++i) dst[i] = Get();
}

bool IByteStream::AtTheEnd() const {
  return CurPos() == Length();
}

unsigned long long IByteStream::Length() const {
  return 0;
}

OByteStream::~OByteStream() = default;

void OByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  for (unsigned long i = 0; i < count; ++i) Put(src[i]);
}

void OByteStream::OSFlush() {
  ProgramFault("OSFlush");
}

void OByteStream::Truncate(unsigned long long) {
  ProgramFault("Truncate");
}

}  // namespace kelcore::filesupport
