// Sleeping on a 32-bit word until another thread changes it: the one place where the
// executors ask the operating system to block a thread.
//
// WaitOnWord returns when the word no longer holds `expected` (it may also return
// spuriously, or at once if the word already differs), or when the time runs out.
// Callers loop on their own condition. The wake functions wake threads sleeping on the
// word; a waker changes the word before waking, so a thread about to sleep on the old
// value does not sleep. None of these functions gives memory ordering by itself: the
// atomic operations on the word do.
#pragma once

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

// A negative time waits without limit.
void WaitOnWord(std::atomic<std::uint32_t>& word, std::uint32_t expected,
                std::int64_t timeoutMicroseconds) noexcept;
void WakeOneOnWord(std::atomic<std::uint32_t>& word) noexcept;
void WakeAllOnWord(std::atomic<std::uint32_t>& word) noexcept;

}  // namespace kelcore::threads::detail
