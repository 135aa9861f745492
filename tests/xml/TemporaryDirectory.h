// A fresh directory under the system's temporary folder, removed with its contents when
// the object goes away.
#pragma once

#include <filesystem>
#include <fstream>
#include <random>
#include <string>

namespace kelcore::xml::test_support {

class TemporaryDirectory {
 public:
  TemporaryDirectory() {
    std::random_device random;
    const auto base = std::filesystem::temp_directory_path();
    do {
      path_ = base / ("kelcore-xml-" + std::to_string(random()) + std::to_string(random()));
    } while (!std::filesystem::create_directory(path_));
  }
  ~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  const std::filesystem::path& Path() const { return path_; }

  // Writes `contents` to the file `name` in the directory and returns its full path.
  std::string Write(const std::string& name, const std::string& contents) const {
    const std::filesystem::path file = path_ / name;
    std::ofstream(file, std::ios::binary) << contents;
    return file.string();
  }

 private:
  std::filesystem::path path_;
};

}  // namespace kelcore::xml::test_support
