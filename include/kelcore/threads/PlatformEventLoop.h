// The calling thread's event loop: a per-thread message queue that the library's event
// loop adaptors post to, pumped by RunPlatformEventLoop or by a host's own loop.
//
// Each thread gets its queue on first use (by one of the functions below or by
// AdaptCurrentEventLoopAsExecutor); it ends with the thread, and messages still queued
// then are destroyed without running. Functions carried by messages run on the queue's
// thread only, inside one of the calls below; an exception escaping one is reported
// through the assert facility (kelcore/debug/Assert.h) and the loop goes on. Messages
// sent from other threads are taken before the messages posted by the thread itself;
// within each kind the order is kept. A quit message (see
// AsyncEventLoopAdaptor::Terminate) is taken in its place among the posted messages.
//
// Driving the queue from a host's loop: wait until GetPlatformEventLoopHandle() is ready
// (with poll() for POLLIN on Linux, a wait on the event handle on Windows), then call
// DispatchPlatformEventLoopMessages() on the same thread.
#pragma once

#include <kelcore/Export.h>

namespace kelcore::threads {

#if defined(_WIN32)
// An event handle, signalled exactly while the queue holds messages.
using PlatformEventLoopHandle = void*;
#else
// A file descriptor, readable exactly while the queue holds messages. Only wait on it:
// reading or closing it breaks the queue.
using PlatformEventLoopHandle = int;
#endif

// Takes and runs the calling thread's messages, waiting while there are none, until it
// takes a quit message (which it consumes). Calls may nest: a function running inside
// the loop may run a loop of its own, which the next quit message ends. Throws
// std::system_error when the thread's queue cannot be made.
KELCORE_API void RunPlatformEventLoop();

// The calling thread's wait handle; valid while the thread lives. Throws
// std::system_error when the thread's queue cannot be made.
KELCORE_API PlatformEventLoopHandle GetPlatformEventLoopHandle();

// Runs, without waiting, the messages that the calling thread's queue held when the call
// started (messages queued meanwhile are left for the next call, so a function that
// posts itself again cannot hold the caller forever). Returns false when it took a quit
// message (it stops there and the host should leave its loop), true otherwise. Throws
// std::system_error when the thread's queue cannot be made.
KELCORE_API bool DispatchPlatformEventLoopMessages();

}  // namespace kelcore::threads
