// Asking the operating system to end the calling thread's timed waits as close to
// their deadline as it can, for the thread that fires delayed calls.
#pragma once

namespace kelcore::threads::detail {

// Best effort; affects the calling thread only.
void RequestPreciseTimedWaits() noexcept;

}  // namespace kelcore::threads::detail
