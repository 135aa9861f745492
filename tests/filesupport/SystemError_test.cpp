#include <gtest/gtest.h>

#include <cerrno>
#include <string>

#include "TempDirFixture.h"
#include "filesupport/SystemError.h"

namespace {

using namespace kelcore::filesupport::detail;

// The errno translation table of the platform notes, one row each.
TEST(SystemError, TranslatesEveryErrnoOfTheTable) {
  struct Row {
    int errnoValue;
    unsigned long file;
    unsigned long directory;
  };
  const Row rows[] = {
      {ENOTDIR, 3, 3},
      {EACCES, 5, 5},
      {EPERM, 5, 5},
      {EISDIR, 5, 5},
      {EEXIST, 80, 183},
      {EROFS, 19, 19},
      {EBADF, 6, 6},
      {EMFILE, 4, 4},
      {ENFILE, 4, 4},
      {ENOSPC, 112, 112},
      {ENAMETOOLONG, 206, 206},
      {EBUSY, 32, 32},
      {ETXTBSY, 32, 32},
      {EINVAL, 87, 87},
      {EIO, 31, 31},
      {ELOOP, 31, 31},
      {0, 31, 31},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(TranslateErrno(row.errnoValue, ObjectKind::kFile, false), row.file)
        << "errno " << row.errnoValue;
    EXPECT_EQ(TranslateErrno(row.errnoValue, ObjectKind::kDirectory, false), row.directory)
        << "errno " << row.errnoValue;
  }
  EXPECT_EQ(TranslateErrno(EEXIST, ObjectKind::kMapping, false), 183u);
  EXPECT_EQ(TranslateErrno(ENOENT, ObjectKind::kFile, false), 2u);
  EXPECT_EQ(TranslateErrno(ENOENT, ObjectKind::kFile, true), 3u);
}

class SystemErrorOnDisk : public TempDirTest {};

TEST_F(SystemErrorOnDisk, EnoentIsThreeOnlyWhenTheParentIsMissing) {
  MakeDir("present");
  WriteFile("plain");
  const std::string root = RootBytes();
  EXPECT_EQ(SystemErrorCode(ENOENT, ObjectKind::kFile, root + "/present/missing"), 2u);
  EXPECT_EQ(SystemErrorCode(ENOENT, ObjectKind::kFile, root + "/absent/missing"), 3u);
  EXPECT_EQ(SystemErrorCode(ENOENT, ObjectKind::kFile, root + "/plain/missing"), 3u);
  EXPECT_EQ(SystemErrorCode(ENOENT, ObjectKind::kFile, "relative-name"), 2u);
  EXPECT_EQ(SystemErrorCode(ENOENT, ObjectKind::kFile, "/top-level-name"), 2u);
}

TEST(SystemError, KeepsErrnoAndRecordsTheTranslatedValue) {
  errno = ELOOP;
  EXPECT_EQ(LastSystemErrorCode(ObjectKind::kFile, "/no/such/kelcore/dir/x"), 31u);
  EXPECT_EQ(errno, ELOOP);
  EXPECT_EQ(LastTranslatedErrno(), ELOOP);
  errno = ENOENT;
  EXPECT_EQ(LastSystemErrorCode(ObjectKind::kFile, "/no/such/kelcore/dir/x"), 3u);
  EXPECT_EQ(errno, ENOENT);
  EXPECT_EQ(LastTranslatedErrno(), ENOENT);
}

}  // namespace
