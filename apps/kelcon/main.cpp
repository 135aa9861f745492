// kelcon: a host program that sets kelcore up the way an application does and reports
// what it set up.
#include <kelcore/kelcore.h>

#include <cstdio>
#include <string>

namespace {

using namespace kelcore;

std::string Narrow(const UTF16String& text) {
  const UTF8String bytes = utility::UTF16to8(text);
  return std::string(bytes.begin(), bytes.end());
}

UTF16String Wide(const char* text) {
  return utility::UTF8to16(UTF8String(utility::AsciiToUTF8Impl(text)));
}

}  // namespace

int main() {
  // 1. The error manager and localizer: the library's defaults, as a host without its
  //    own uses them.
  config::DefaultLocalizer localizer;
  config::DefaultErrorManager errorManager;
  config::Localizer::Set(&localizer);
  config::ErrorManager::Set(&errorManager);

  // 2. The host's identity.
  config::SetCompanyName(Wide("Varden"));
  config::SetClientName(Wide("kelcon"));
  config::SetClientVersion(Wide("2.0"));

  std::printf("kelcon %s on %s\n", Narrow(config::GetVersionString()).c_str(),
              Narrow(config::GetClientPlatform()).c_str());
  std::printf("  error manager and localizer: library defaults installed\n");
  std::printf("  identity: %s\n", Narrow(config::GetSuiteClientName()).c_str());
  std::printf("  small-block allocator: a 100-byte request receives %u bytes\n",
              utility::SmallBlockAllocator::GetActualAllocationSize(100));

  // The error channel end to end: a self-test error, localized and caught.
  try {
    config::TestThrowError(false);
  } catch (const config::LocalizedError& error) {
    std::printf("  error channel: %s\n", error.what());
  }

  // Shut-down reverses the start-up.
  config::ErrorManager::Set(nullptr);
  config::Localizer::Set(nullptr);
  return 0;
}
