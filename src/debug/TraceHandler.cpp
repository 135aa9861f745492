#include <kelcore/debug/TraceHandler.h>

#include <kelcore/debug/DefaultTraceHandler.h>

#include <atomic>

namespace kelcore::debug {

namespace {

// Null while the default handler serves. Release on install, acquire on use, so a
// handler installed before another thread traces is seen fully constructed there.
std::atomic<TraceHandler*> masterHandler{nullptr};

}  // namespace

TraceHandler::~TraceHandler() = default;

void InstallMasterTraceHandler(TraceHandler* handler) {
  masterHandler.store(handler, std::memory_order_release);
}

void RemoveMasterTraceHandler() {
  masterHandler.store(nullptr, std::memory_order_release);
}

TraceHandler* GetMasterTraceHandler() {
  TraceHandler* handler = masterHandler.load(std::memory_order_acquire);
  return handler != nullptr ? handler : &DefaultTraceHandler::Instance();
}

}  // namespace kelcore::debug
