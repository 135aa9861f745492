// A save killed at any instant leaves the file loadable with either its old or its new
// content: a child process saves over the file again and again while the parent kills it
// with SIGKILL after varied delays. POSIX only (fork, kill).
#include <kelcore/proplist/PropListUtils.h>

#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <thread>

#include "PropListPersistenceSupport.h"
#include "PropListTestSupport.h"
#include "RandomPropList.h"

namespace kelcore::proplist::testing {
namespace {

#if defined(KELCORE_TESTS_SANITIZED)
constexpr int kKills = 80;
#else
constexpr int kKills = 300;
#endif
// Delays run from 0 to this, spread over the iterations, so kills land before, during and
// after the writes, flushes and renames of several saves.
constexpr int kMaxDelayMicroseconds = 6000;

PropList BigList(std::uint64_t seed) {
  RandomPropListGenerator random(
      seed, {.maxDepth = 3, .maxEntries = 12, .maxTextLength = 40, .xmlSafe = true});
  return random.Make();
}

std::string Document(const PropList& list) {
  UTF8String text;
  utils::WritePropList(text, list);
  return std::string(text.begin(), text.end());
}

[[noreturn]] void SaveForever(const UTF16String& path, const PropList& a, const PropList& b,
                              int ready) {
  try {
    const char started = 1;
    if (::write(ready, &started, 1) != 1) ::_exit(2);
    for (int i = 0;; ++i) utils::SavePropList(path, i % 2 == 0 ? b : a);
  } catch (...) {
    ::_exit(1);
  }
}

TEST_F(PersistenceTest, KilledSavesNeverLoseTheFile) {
  const PropList a = BigList(11);
  const PropList b = BigList(12);
  const std::string documentA = Document(a);
  const std::string documentB = Document(b);
  ASSERT_NE(documentA, documentB);
  const UTF16String path = PathOf("state.xml");
  const std::filesystem::path file = Directory() / "state.xml";
  utils::SavePropList(path, a);

  int sawNew = 0;
  for (int kill = 0; kill < kKills; ++kill) {
    int ready[2];
    ASSERT_EQ(::pipe(ready), 0);
    const pid_t child = ::fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
      ::close(ready[0]);
      SaveForever(path, a, b, ready[1]);
    }
    ::close(ready[1]);
    char started = 0;
    ASSERT_EQ(::read(ready[0], &started, 1), 1);
    ::close(ready[0]);
    const int delay = static_cast<int>((kill * 7919L) % kMaxDelayMicroseconds);
    std::this_thread::sleep_for(std::chrono::microseconds(delay));
    ASSERT_EQ(::kill(child, SIGKILL), 0);
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFSIGNALED(status)) << "the saving child failed with " << WEXITSTATUS(status);

    ASSERT_TRUE(std::filesystem::exists(file)) << "target missing after kill " << kill;
    const std::string content = FileContent(file);
    ASSERT_TRUE(content == documentA || content == documentB)
        << "kill " << kill << " left " << content.size() << " bytes of neither version";
    sawNew += content == documentB;
    PropList loaded;
    utils::LoadPropList(path, loaded, false);
    ASSERT_EQ(loaded, content == documentA ? a : b);

    // Stray temporary files of killed saves are allowed; clear them away.
    for (const auto& entry : std::filesystem::directory_iterator(Directory())) {
      if (entry.path() != file) std::filesystem::remove(entry.path());
    }
  }
  RecordProperty("kills_leaving_new_content", sawNew);
}

}  // namespace
}  // namespace kelcore::proplist::testing
