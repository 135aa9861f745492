// Its own test program: it replaces the global operator new to count the heap
// allocations made by the library.
#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

#include <atomic>
#include <cstdlib>
#include <new>

namespace {
std::atomic<long> allocations{0};
}  // namespace

// The replacements below pair malloc with free, which GCC takes for a mismatch.
#if defined(__GNUC__) && !defined(__clang__)
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"
#endif

void* operator new(std::size_t size) {
  allocations.fetch_add(1, std::memory_order_relaxed);
  if (void* block = std::malloc(size == 0 ? 1 : size)) return block;
  throw std::bad_alloc();
}
void* operator new[](std::size_t size) {
  return ::operator new(size);
}
void operator delete(void* block) noexcept {
  std::free(block);
}
void operator delete[](void* block) noexcept {
  ::operator delete(block);
}
void operator delete(void* block, std::size_t) noexcept {
  ::operator delete(block);
}
void operator delete[](void* block, std::size_t) noexcept {
  ::operator delete(block);
}

namespace kelcore::utility {
namespace {

// Inputs of up to 256 bytes, valid or stopping early, take no heap memory apart from
// the result string (none at all when the result fits the string's inline buffer).
TEST(UTF8to16, ShortInputsAllocateOnlyTheResult) {
  // a, é, 中, 😀 and a lone surrogate: 1 + 2 + 3 + 4 + 3 bytes.
  const UTF8String pattern = UTF16to8(UTF16String{0x61, 0xE9, 0x4E2D, 0xD83D, 0xDE00, 0xD800});
  for (std::size_t size = 0; size <= 256; ++size) {
    UTF8String input;
    while (input.size() < size) input += pattern;
    input.resize(size);  // may cut a sequence: the conversion then stops early
    UTF16String result;
    const UTF16String empty;
    UnicodeErrorCode code;
    unsigned int length;

    const long before = allocations.load(std::memory_order_relaxed);
    result = UTF8to16(input, &code, &length);
    const long made = allocations.load(std::memory_order_relaxed) - before;

    const long expected = result.capacity() > empty.capacity() ? 1 : 0;
    EXPECT_EQ(made, expected) << "input of " << size << " bytes, " << length << " units";
  }
}

}  // namespace
}  // namespace kelcore::utility
