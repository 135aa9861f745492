#include "LineSource.h"

namespace kelcon {

namespace {

class StreamLineSource : public LineSource {
 public:
  explicit StreamLineSource(std::FILE* file) : file_(file) {}

  bool Next(std::string& line) override {
    line.clear();
    int c = 0;
    bool any = false;
    while ((c = std::getc(file_)) != EOF) {
      any = true;
      if (c == '\n') break;
      line.push_back(static_cast<char>(c));
    }
    if (!line.empty() && line.back() == '\r') line.pop_back();
    return any;
  }

 private:
  std::FILE* file_;
};

}  // namespace

std::unique_ptr<LineSource> MakeStreamLineSource(std::FILE* file) {
  return std::make_unique<StreamLineSource>(file);
}

}  // namespace kelcon
