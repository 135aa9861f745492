#include <kelcore/debug/Trace.h>

#include "debug/DebugOutput.h"
#include "debug/TraceManager.h"

#include <kelcore/debug/TraceHandler.h>

#include <string_view>

namespace kelcore::debug {

void Trace(unsigned char const* text) {
  if (text == nullptr) return;
  GetMasterTraceHandler()->HandleTrace(UTF8String(text));
}

bool TraceEnabled(unsigned char const* category, long volume, bool createIfMissing) {
  if (category == nullptr) return false;
  return TraceManager::Get().Enabled(category, volume, createIfMissing);
}

long GetTraceVolume(unsigned char const* category) {
  if (category == nullptr) return 0;
  return TraceManager::Get().GetVolume(category);
}

void SetTraceVolume(unsigned char const* category, long volume) {
  if (category == nullptr) return;
  TraceManager::Get().SetVolume(category, volume);
}

long GetMasterTraceVolume() {
  return TraceManager::Get().GetMasterVolume();
}

void SetMasterTraceVolume(long volume) {
  TraceManager::Get().SetMasterVolume(volume);
}

void GetTraceCategories(std::list<UTF8String>& categories) {
  TraceManager::Get().GetCategories(categories);
}

void GetTraceDatabaseAsString(UTF8String& text) {
  TraceManager::Get().GetAsString(text);
}

void SetTraceDatabaseFromString(UTF8String const& text) {
  TraceManager::Get().SetFromString(text);
}

int TraceChangeCount() {
  return TraceManager::Get().ChangeCount();
}

void ShutdownTraceManager() {
  TraceManager::Get().Shutdown();
}

bool GetDisableFileWrites() {
  return TraceManager::Get().FileWritesDisabled();
}

void SetDisableFileWrites(bool disable) {
  TraceManager::Get().SetFileWritesDisabled(disable);
}

void DebugTrace(unsigned char const* text) noexcept {
  if (text == nullptr || !IsDebuggerAttached()) return;
  DebugOutput(std::string_view(reinterpret_cast<const char*>(text)));
}

}  // namespace kelcore::debug
