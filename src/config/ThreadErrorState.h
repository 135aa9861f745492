// What the error manager keeps per thread: the thread's id as its reporter map's key,
// and whether DoThrowError is running for an error that was just recorded.
#pragma once

#include <cstdint>

namespace kelcore::config {

struct ThreadErrorState {
  std::uint32_t threadId = 0;  // 0 until CurrentThreadId first runs on the thread
  bool raisingRecordedError = false;
};

// The calling thread's state; cheap (no lookup function call on POSIX).
ThreadErrorState& ThisThreadErrorState() noexcept;

// The operating system's id of the calling thread, unique among the live threads of the
// process (an id may be reused after its thread has ended).
std::uint32_t ReadThreadId() noexcept;

inline std::uint32_t CurrentThreadId(ThreadErrorState& state) noexcept {
  if (state.threadId == 0) state.threadId = ReadThreadId();
  return state.threadId;
}

}  // namespace kelcore::config
