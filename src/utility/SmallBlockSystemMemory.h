// Memory the small-block allocator takes from the operating system: committed,
// page-aligned regions for chunks and large blocks, and the 16-byte aligned heap that
// serves small requests while the pools are switched off.
#pragma once

#include <cstddef>

namespace kelcore::utility::smallblock {

// Committed, readable and writable, zero-filled, page-aligned; null on failure.
void* MapPages(std::size_t bytes) noexcept;
// `bytes` must be the size given to MapPages.
void UnmapPages(void* region, std::size_t bytes) noexcept;

// 16-byte aligned; `bytes` must be a non-zero multiple of 16. Null on failure.
void* AlignedHeapAllocate(std::size_t bytes) noexcept;
void AlignedHeapFree(void* block) noexcept;

}  // namespace kelcore::utility::smallblock
