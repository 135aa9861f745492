// A fresh directory under $TMPDIR (else /tmp) for each file-system test, removed with
// everything in it afterwards.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <string>

#include <kelcore/filesupport/Dir.h>
#include <kelcore/utility/StringTypes.h>

class TempDirTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const char* base = std::getenv("TMPDIR");
    std::string pattern =
        std::string(base != nullptr && *base != '\0' ? base : "/tmp") + "/kelcore-files-XXXXXX";
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr) << pattern;
    root_ = pattern;
  }

  void TearDown() override {
    std::error_code ignored;
    // Tests may leave read-only directories behind when they fail half way.
    for (const auto& entry : std::filesystem::recursive_directory_iterator(root_, ignored)) {
      if (entry.is_directory(ignored) && !entry.is_symlink(ignored)) {
        std::filesystem::permissions(entry.path(), std::filesystem::perms::owner_all,
                                     std::filesystem::perm_options::add, ignored);
      }
    }
    std::filesystem::remove_all(root_, ignored);
  }

  // The temporary directory as the bytes of its path.
  const std::string& RootBytes() const { return root_; }
  kelcore::filesupport::Dir Root() const { return kelcore::filesupport::Dir(root_); }
  kelcore::UTF16String RootPath() const { return Root().FullPath(); }

  // Writes `contents` to the file at `relative` (bytes) below the temporary directory.
  void WriteFile(const std::string& relative, const std::string& contents = std::string()) {
    std::ofstream out(root_ + "/" + relative, std::ios::binary);
    out << contents;
    ASSERT_TRUE(out.good()) << relative;
  }
  void MakeDir(const std::string& relative) {
    ASSERT_TRUE(std::filesystem::create_directories(root_ + "/" + relative)) << relative;
  }
  bool OnDisk(const std::string& relative) const {
    std::error_code ignored;
    return std::filesystem::exists(
        std::filesystem::symlink_status(root_ + "/" + relative, ignored));
  }

 private:
  std::string root_;
};
