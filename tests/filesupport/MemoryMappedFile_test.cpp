#include <kelcore/config/ErrorManager.h>
#include <kelcore/filesupport/MemoryMappedFile.h>

#include <gtest/gtest.h>

#include <cstring>
#include <stdexcept>
#include <string>
#include <vector>

#include "SharedBlockNames.h"

namespace {

using kelcore::MemoryMappedFile;

constexpr unsigned long kCreateWrite = MemoryMappedFile::kCreate | MemoryMappedFile::kWrite;

long CaughtLong(MemoryMappedFile& block) {
  try {
    block.GetAddress();
  } catch (long code) {
    return code;
  }
  return 0;
}

TEST(MemoryMappedFileTest, CreatorAndOpenerShareTheBlock) {
  const std::string name = UniqueBlockName();
  MemoryMappedFile creator;
  ASSERT_TRUE(creator.Open(name, 4096, kCreateWrite | MemoryMappedFile::kMapNow));
  EXPECT_TRUE(creator.Created());
  EXPECT_TRUE(creator.MappedMemoryIsWritable());
  std::memcpy(creator.GetAddress(), "shared", 7);

  // Creating again under the same name opens the existing block.
  MemoryMappedFile second;
  ASSERT_TRUE(second.Open(name, 4096, kCreateWrite));
  EXPECT_FALSE(second.Created());
  EXPECT_EQ(second.Flags() & MemoryMappedFile::kCreatedBlock, 0u);
  EXPECT_STREQ(static_cast<const char*>(second.GetAddress()), "shared");

  // Flags 0: a read-only view of the same memory.
  MemoryMappedFile reader;
  ASSERT_TRUE(reader.Open(name, 4096, 0));
  EXPECT_FALSE(reader.MappedMemoryIsWritable());  // no view yet
  const char* seen = static_cast<const char*>(reader.GetAddress());
  EXPECT_FALSE(reader.MappedMemoryIsWritable());
  static_cast<char*>(creator.GetAddress())[0] = 'S';
  EXPECT_STREQ(seen, "Shared");
  std::string stored;
  reader.GetName(stored);
  EXPECT_EQ(stored, name);
}

TEST(MemoryMappedFileTest, MissingNameFails) {
  const std::string name = UniqueBlockName();
  for (const unsigned long flags : {0ul, MemoryMappedFile::kMapNow, MemoryMappedFile::kWrite,
                                    MemoryMappedFile::kWriteNoReopen}) {
    MemoryMappedFile block;
    EXPECT_FALSE(block.Open(name, 64, flags)) << flags;
    EXPECT_EQ(CaughtLong(block), 9002);
    EXPECT_EQ(block.Flags() & (MemoryMappedFile::kCreatedBlock | MemoryMappedFile::kReadWriteView),
              0u);
  }
  MemoryMappedFile block;
  EXPECT_THROW(block.Init(name, 64, 0), long);
  EXPECT_FALSE(block.Open("no/slash/allowed", 64, kCreateWrite));
  EXPECT_FALSE(block.Open("", 64, kCreateWrite));
}

TEST(MemoryMappedFileTest, UnmapKeepsTheHandleAndRemapsTheSameBlock) {
  const std::string name = UniqueBlockName();
  MemoryMappedFile block;
  block.Init(name, 100, kCreateWrite);
  std::memcpy(block.GetAddress(), "kept", 5);
  block.CloseFileHandleIfPossible();
  EXPECT_FALSE(block.MappedMemoryIsWritable());
  EXPECT_STREQ(static_cast<const char*>(block.GetAddress()), "kept");
  block.UnmapMemory();
  EXPECT_STREQ(static_cast<const char*>(block.GetAddress()), "kept");
  EXPECT_TRUE(block.MappedMemoryIsWritable());
}

TEST(MemoryMappedFileTest, NameIsRemovedWithItsLastHolder) {
  const std::string name = UniqueBlockName();
  {
    MemoryMappedFile creator;
    creator.Init(name, 64, kCreateWrite);
    MemoryMappedFile opener;
    opener.Init(name, 64, 0);
    creator.Reset();
    EXPECT_EQ(creator.Flags() & MemoryMappedFile::kCreatedBlock, 0u);
    MemoryMappedFile stillThere;
    EXPECT_TRUE(stillThere.Open(name, 64, 0));  // the opener still holds it
  }
  MemoryMappedFile after;
  EXPECT_FALSE(after.Open(name, 64, 0));
}

TEST(MemoryMappedFileTest, CopiesShareHandleAndViewWithoutDoubleRelease) {
  const std::string name = UniqueBlockName();
  MemoryMappedFile original;
  original.Init(name, 64, kCreateWrite | MemoryMappedFile::kMapNow);
  void* address = original.GetAddress();
  {
    MemoryMappedFile copy(original);
    EXPECT_EQ(copy.GetAddress(), address);
    EXPECT_TRUE(copy.Created());
  }
  std::memcpy(address, "alive", 6);  // the copy's end left the view mapped
  MemoryMappedFile assigned;
  assigned = original;
  original.Reset();
  EXPECT_STREQ(static_cast<const char*>(assigned.GetAddress()), "alive");
}

TEST(MemoryMappedFileTest, SizeRules) {
  const std::string name = UniqueBlockName();
  MemoryMappedFile block;
  EXPECT_THROW(block.Open(name, 0x100000000ULL, kCreateWrite), std::length_error);
  block.Init(name, 8192, kCreateWrite);
  // Size 0 maps the whole block and reports its size.
  MemoryMappedFile whole;
  whole.Init(name, 0, MemoryMappedFile::kMapNow);
  EXPECT_EQ(whole.Size(), 8192u);
  // A bigger view than the block is refused rather than mapped past its end.
  MemoryMappedFile tooBig;
  EXPECT_TRUE(tooBig.Open(name, 8193, 0));
  EXPECT_EQ(CaughtLong(tooBig), 9002);
  EXPECT_FALSE(tooBig.Open(name, 8193, MemoryMappedFile::kMapNow));
}

// Records the memory requests of the retry and, when told to, creates the missing block as
// if freeing memory had made room for it.
class RecordingManager : public kelcore::config::ErrorManager {
 public:
  bool PurgeMemory(unsigned int bytes) override {
    requests.push_back(bytes);
    if (!nameToCreate.empty()) made.Init(nameToCreate, 64, kCreateWrite);
    return true;
  }
  std::vector<unsigned int> requests;
  std::string nameToCreate;
  MemoryMappedFile made;

 protected:
  void DoThrowError(kelcore::config::ErrorLevel, const char*, unsigned long, long, bool,
                    const kelcore::config::ReplacementValue&,
                    const kelcore::config::ReplacementValue&,
                    const kelcore::config::ReplacementValue&,
                    const kelcore::config::ReplacementValue&) override {}
};

class MemoryMappedFileRetryTest : public ::testing::Test {
 protected:
  void SetUp() override { kelcore::config::ErrorManager::Set(&manager_); }
  void TearDown() override { kelcore::config::ErrorManager::Set(nullptr); }
  RecordingManager manager_;
};

TEST_F(MemoryMappedFileRetryTest, MapNowFailureAsksForMemoryOnceThenRetries) {
  const std::string name = UniqueBlockName();
  MemoryMappedFile block;
  EXPECT_FALSE(block.Open(name, 0x1234, 0));
  EXPECT_TRUE(manager_.requests.empty());
  EXPECT_FALSE(block.Open(name, 0xFFFFFFFFULL, MemoryMappedFile::kMapNow));
  EXPECT_EQ(manager_.requests, std::vector<unsigned int>{0xFFFFFFFFu});

  manager_.requests.clear();
  manager_.nameToCreate = name;
  EXPECT_TRUE(block.Open(name, 64, MemoryMappedFile::kMapNow));
  EXPECT_EQ(manager_.requests, std::vector<unsigned int>{64});
  EXPECT_FALSE(block.Created());
}

}  // namespace
