// The interactive line source over libedit's readline interface.
#include <editline/readline.h>

#include <kelcore/console/CommandRegistry.h>

#include <cstdlib>
#include <cstring>
#include <vector>

#include "CommandText.h"
#include "LineSource.h"

namespace kelcon {

namespace {

// The command names that start with the word being completed, gathered when a
// completion begins and handed out one by one, as readline asks for them.
std::vector<std::string> completionCandidates;
std::size_t nextCandidate = 0;

char* NextCommandName(const char* text, int state) {
  if (state == 0) {
    completionCandidates.clear();
    nextCandidate = 0;
    const std::size_t length = std::strlen(text);
    kelcore::console::CommandRegistry::ForEachCommand(
        [&](const kelcore::console::CommandRegistry::Record& record) {
          const std::string name = ToNarrow(record.name);
          if (name.compare(0, length, text) == 0) completionCandidates.push_back(name);
        });
  }
  if (nextCandidate == completionCandidates.size()) return nullptr;
  // readline frees what it receives.
  return strdup(completionCandidates[nextCandidate++].c_str());
}

char** CompleteCommandName(const char* text, int start, int /*end*/) {
  // The first word names a command; later words are left to file-name completion.
  if (start != 0) return nullptr;
  return rl_completion_matches(text, NextCommandName);
}

class TerminalLineSource : public LineSource {
 public:
  explicit TerminalLineSource(std::string historyPath) : historyPath_(std::move(historyPath)) {
    rl_readline_name = const_cast<char*>("kelcon");
    rl_attempted_completion_function = CompleteCommandName;
    using_history();
    stifle_history(1000);
    if (!historyPath_.empty()) read_history(historyPath_.c_str());
  }

  ~TerminalLineSource() override {
    if (!historyPath_.empty()) write_history(historyPath_.c_str());
  }

  bool Next(std::string& line) override {
    char* text = readline("kelcon> ");
    if (text == nullptr) return false;
    line = text;
    std::free(text);
    const std::string trimmed = TrimSpaces(line);
    if (!trimmed.empty() && trimmed != lastEntry_) {
      add_history(trimmed.c_str());
      lastEntry_ = trimmed;
    }
    return true;
  }

 private:
  std::string historyPath_;
  std::string lastEntry_;
};

}  // namespace

std::unique_ptr<LineSource> MakeTerminalLineSource(const std::string& historyPath) {
  return std::make_unique<TerminalLineSource>(historyPath);
}

}  // namespace kelcon
