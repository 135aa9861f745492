#include <kelcore/console/UTF16OutputStream.h>

#include <kelcore/logging/ConsoleLogFile.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <charconv>
#include <cstdio>
#include <stdexcept>
#include <utility>

namespace kelcore::console {

namespace {

UTF16String FromUTF8(std::string_view utf8) {
  return utility::UTF8to16(
      UTF8String(reinterpret_cast<const unsigned char*>(utf8.data()), utf8.size()));
}

class StringTarget final : public UTF16OutputStream::Target {
 public:
  explicit StringTarget(UTF16String& buffer) : buffer_(buffer) {}
  void Write(UTF16StringView text) override { buffer_.append(text); }

 private:
  UTF16String& buffer_;
};

// Keeps text until a line is complete, so that each destination call receives whole
// lines (and whole surrogate pairs).
class LineTarget : public UTF16OutputStream::Target {
 public:
  void Write(UTF16StringView text) override {
    pending_.append(text);
    const std::size_t lastLineEnd = pending_.rfind(UTF16Char('\n'));
    if (lastLineEnd == UTF16String::npos) return;
    const UTF16String lines = pending_.substr(0, lastLineEnd + 1);
    pending_.erase(0, lastLineEnd + 1);
    Deliver(lines);
  }
  void Flush() override {
    if (pending_.empty()) return;
    Deliver(std::exchange(pending_, UTF16String()));
  }

 protected:
  // Receives one or more lines, each ending in "\n", or the text left at a flush.
  virtual void Deliver(const UTF16String& text) = 0;

 private:
  UTF16String pending_;
};

class TerminalTarget final : public LineTarget {
 protected:
  void Deliver(const UTF16String& text) override {
    const UTF8String utf8 = utility::UTF16to8(text);
    std::fwrite(utf8.data(), 1, utf8.size(), stdout);
    std::fflush(stdout);
  }
};

class LogFileTarget final : public LineTarget {
 public:
  explicit LogFileTarget(bool addTicks) : addTicks_(addTicks) {}

 protected:
  void Deliver(const UTF16String& text) override {
    ConsoleLogFile& log = ConsoleLogFile::GetInstance();
    std::size_t start = 0;
    while (start < text.size()) {
      std::size_t end = text.find(UTF16Char('\n'), start);
      end = end == UTF16String::npos ? text.size() : end + 1;
      log.WriteToLog(utility::UTF16to8(text.substr(start, end - start)), addTicks_);
      start = end;
    }
  }

 private:
  bool addTicks_;
};

}  // namespace

UTF16OutputStream::Target::~Target() = default;

void UTF16OutputStream::Target::Flush() {}

UTF16OutputStream::UTF16OutputStream(UTF16String& buffer)
    : target_(std::make_unique<StringTarget>(buffer)) {}

UTF16OutputStream::UTF16OutputStream(std::unique_ptr<Target> target) : target_(std::move(target)) {
  if (target_ == nullptr) throw std::invalid_argument("UTF16OutputStream: null target");
}

UTF16OutputStream UTF16OutputStream::Terminal() {
  return UTF16OutputStream(std::make_unique<TerminalTarget>());
}

UTF16OutputStream UTF16OutputStream::LogFile(bool addTicks) {
  return UTF16OutputStream(std::make_unique<LogFileTarget>(addTicks));
}

UTF16OutputStream::UTF16OutputStream(UTF16OutputStream&& other) noexcept = default;

UTF16OutputStream& UTF16OutputStream::operator=(UTF16OutputStream&& other) noexcept {
  if (this != &other) {
    try {
      Flush();
    } catch (...) {
      // The text for the old target is lost; the assignment itself cannot fail.
    }
    target_ = std::move(other.target_);
  }
  return *this;
}

UTF16OutputStream::~UTF16OutputStream() {
  try {
    Flush();
  } catch (...) {
    // A destructor cannot report a failing target.
  }
}

UTF16OutputStream& UTF16OutputStream::Flush() {
  if (target_ != nullptr) target_->Flush();
  return *this;
}

UTF16OutputStream& UTF16OutputStream::operator<<(UTF16StringView text) {
  if (target_ != nullptr && !text.empty()) target_->Write(text);
  return *this;
}

UTF16OutputStream& UTF16OutputStream::operator<<(const UTF16Char* text) {
  if (text == nullptr) return *this;
  return *this << UTF16StringView(text);
}

UTF16OutputStream& UTF16OutputStream::operator<<(std::string_view utf8) {
  if (utf8.empty()) return *this;
  return *this << FromUTF8(utf8);
}

UTF16OutputStream& UTF16OutputStream::operator<<(const UTF8String& utf8) {
  if (utf8.empty()) return *this;
  return *this << utility::UTF8to16(utf8);
}

UTF16OutputStream& UTF16OutputStream::operator<<(const char* utf8) {
  if (utf8 == nullptr) return *this;
  return *this << std::string_view(utf8);
}

UTF16OutputStream& UTF16OutputStream::operator<<(double value) {
  // The longest "%.6g" text is "-1.23457e-308": far below the buffer's size.
  char buffer[32];
  const auto result =
      std::to_chars(buffer, buffer + sizeof buffer, value, std::chars_format::general, 6);
  return *this << std::string_view(buffer, static_cast<std::size_t>(result.ptr - buffer));
}

UTF16OutputStream& UTF16OutputStream::operator<<(std::ostream& (*manipulator)(std::ostream&)) {
  using Traits = std::char_traits<char>;
  if (manipulator == &std::endl<char, Traits>) return endl(*this);
  if (manipulator == &std::flush<char, Traits>) return Flush();
  throw std::invalid_argument("UTF16OutputStream: unsupported manipulator");
}

UTF16OutputStream& UTF16OutputStream::WriteSigned(long long value) {
  char buffer[24];
  const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
  return *this << std::string_view(buffer, static_cast<std::size_t>(result.ptr - buffer));
}

UTF16OutputStream& UTF16OutputStream::WriteUnsigned(unsigned long long value) {
  char buffer[24];
  const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
  return *this << std::string_view(buffer, static_cast<std::size_t>(result.ptr - buffer));
}

UTF16OutputStream& endl(UTF16OutputStream& out) {
  return (out << UTF16Char('\n')).Flush();
}

UTF16OutputStream& flush(UTF16OutputStream& out) {
  return out.Flush();
}

}  // namespace kelcore::console
