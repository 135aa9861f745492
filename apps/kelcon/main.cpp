// kelcon: a host program that sets kelcore up the way an application does and reports
// what it set up.
#include <kelcore/kelcore.h>

#include <cstdio>

int main() {
  using namespace kelcore;
  std::printf("kelcon: kelcore %s\n", "2.0.0");
  const unsigned int probe = 100;
  std::printf("  small-block allocator: a %u-byte request receives %u bytes\n", probe,
              utility::SmallBlockAllocator::GetActualAllocationSize(probe));
  const UTF16String text = utility::UTF8to16(UTF8String(utility::AsciiToUTF8Impl("kelcore")));
  std::printf("  text: UTF-8/UTF-16 conversion ready (%zu units)\n", text.size());
  return 0;
}
