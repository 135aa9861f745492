// Blocks left behind by a process that was killed while it held them (POSIX: fork and
// SIGKILL).
#include <kelcore/filesupport/MemoryMappedFile.h>

#include <gtest/gtest.h>

#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <cstring>
#include <string>

#include "SharedBlockNames.h"

namespace {

using kelcore::MemoryMappedFile;

constexpr unsigned long kCreateWrite = MemoryMappedFile::kCreate | MemoryMappedFile::kWrite;

// Forks a child that creates `name` with `size` bytes, writes "stale" into it, reports
// through a pipe and waits to be killed; the parent kills it with SIGKILL.
void CreateInChildAndKillIt(const std::string& name, unsigned long long size) {
  int ready[2];
  ASSERT_EQ(pipe(ready), 0);
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) {
    close(ready[0]);
    MemoryMappedFile block;
    char status = block.Open(name, size, kCreateWrite | MemoryMappedFile::kMapNow) ? 'y' : 'n';
    if (status == 'y') std::memcpy(block.GetAddress(), "stale", 6);
    if (write(ready[1], &status, 1) != 1) _exit(2);
    for (;;) pause();
  }
  close(ready[1]);
  char status = 0;
  const ssize_t got = read(ready[0], &status, 1);
  close(ready[0]);
  kill(child, SIGKILL);
  int waitStatus = 0;
  ASSERT_EQ(waitpid(child, &waitStatus, 0), child);
  ASSERT_EQ(got, 1);
  ASSERT_EQ(status, 'y');
  ASSERT_TRUE(WIFSIGNALED(waitStatus));
}

TEST(MemoryMappedFileProcessTest, CreateAfterACrashOpensTheStaleBlockAndCleansUp) {
  const std::string name = UniqueBlockName();
  CreateInChildAndKillIt(name, 4096);
  {
    MemoryMappedFile block;
    ASSERT_TRUE(block.Open(name, 4096, kCreateWrite | MemoryMappedFile::kMapNow));
    EXPECT_FALSE(block.Created());
    EXPECT_EQ(block.Flags() & MemoryMappedFile::kCreatedBlock, 0u);
    EXPECT_STREQ(static_cast<const char*>(block.GetAddress()), "stale");
  }
  // The last holder removed the name: a new create really creates.
  MemoryMappedFile fresh;
  ASSERT_TRUE(fresh.Open(name, 4096, kCreateWrite | MemoryMappedFile::kMapNow));
  EXPECT_TRUE(fresh.Created());
  EXPECT_EQ(static_cast<const char*>(fresh.GetAddress())[0], '\0');
}

TEST(MemoryMappedFileProcessTest, StaleBlockOfAnotherSizeIsNotMappedPastItsEnd) {
  const std::string name = UniqueBlockName();
  CreateInChildAndKillIt(name, 100);
  MemoryMappedFile bigger;
  ASSERT_TRUE(bigger.Open(name, 1 << 20, kCreateWrite));
  EXPECT_FALSE(bigger.Created());
  EXPECT_THROW(bigger.GetAddress(), long);
  // The block's own size maps.
  MemoryMappedFile exact;
  ASSERT_TRUE(exact.Open(name, 100, MemoryMappedFile::kMapNow));
  EXPECT_STREQ(static_cast<const char*>(exact.GetAddress()), "stale");
  // Once both let go the stale name is gone, and creating gives the size asked for.
  bigger.Reset();
  exact.Reset();
  ASSERT_TRUE(bigger.Open(name, 1 << 20, kCreateWrite | MemoryMappedFile::kMapNow));
  EXPECT_TRUE(bigger.Created());
  static_cast<char*>(bigger.GetAddress())[(1 << 20) - 1] = 'x';
}

// While an object holds a block, opening its name must give that same block, even while
// another process keeps creating and releasing the name. A holder that removed the name
// under a live holder would break this.
bool HoldersAlwaysShareTheNamedBlock(const std::string& name, int slot) {
  for (int round = 1; round <= 300; ++round) {
    MemoryMappedFile holder;
    if (!holder.Open(name, 64, kCreateWrite | MemoryMappedFile::kMapNow)) return false;
    const int marker = round * 2 + slot;
    std::atomic_ref<int>(static_cast<int*>(holder.GetAddress())[slot]).store(marker);
    MemoryMappedFile opener;
    if (!opener.Open(name, 64, MemoryMappedFile::kMapNow)) return false;
    if (std::atomic_ref<int>(static_cast<int*>(opener.GetAddress())[slot]).load() != marker) {
      return false;
    }
  }
  return true;
}

TEST(MemoryMappedFileProcessTest, NameIsNeverRemovedUnderALiveHolder) {
  const std::string name = UniqueBlockName();
  const pid_t child = fork();
  ASSERT_GE(child, 0);
  if (child == 0) _exit(HoldersAlwaysShareTheNamedBlock(name, 1) ? 0 : 1);
  const bool parentOk = HoldersAlwaysShareTheNamedBlock(name, 0);
  int waitStatus = 0;
  ASSERT_EQ(waitpid(child, &waitStatus, 0), child);
  EXPECT_TRUE(parentOk);
  EXPECT_TRUE(WIFEXITED(waitStatus) && WEXITSTATUS(waitStatus) == 0);
  MemoryMappedFile after;
  EXPECT_FALSE(after.Open(name, 64, 0));
}

}  // namespace
