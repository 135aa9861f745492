#include <kelcore/threads/NamedThread.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace kelcore::threads {
namespace {

TEST(NamedThread, RunsStartBodyAndEndInOrderOnTheNewThread) {
  std::vector<std::string> steps;
  std::thread::id bodyThread;
  std::thread thread = CreateNamedThread(
      "order", kThreadPriorityNormal, [&] { steps.push_back("start"); },
      [&] { steps.push_back("end"); },
      [&] {
        steps.push_back("body");
        bodyThread = std::this_thread::get_id();
      });
  const std::thread::id id = thread.get_id();
  thread.join();
  EXPECT_EQ(steps, (std::vector<std::string>{"start", "body", "end"}));
  EXPECT_GE(CPUCount(), 1);
  EXPECT_EQ(bodyThread, id);
}

TEST(NamedThread, EmptyPartsAreSkippedAndAThrowingBodyStillEnds) {
  bool ended = false;
  testing::internal::CaptureStderr();
  std::thread thread = CreateNamedThread(
      "throws", kThreadPriorityNormal, {}, [&] { ended = true; },
      [] { throw std::runtime_error("body failed"); });
  thread.join();
  const std::string report = testing::internal::GetCapturedStderr();
  EXPECT_TRUE(ended);
  EXPECT_NE(report.find("body failed"), std::string::npos) << report;
}

#if defined(__linux__)

std::string ReadThreadFile(const char* name) {
  std::ifstream file(std::string("/proc/thread-self/") + name);
  std::stringstream text;
  text << file.rdbuf();
  return text.str();
}

// The kernel keeps 15 bytes of a name; a multi-byte character is never cut in half.
TEST(NamedThread, NameIsVisibleToSystemTools) {
  const struct {
    std::string name;
    std::string shown;
  } rows[] = {
      {"Worker", "Worker"},
      {"abcdefghijklmnopqrstuvwxyz", "abcdefghijklmno"},
      {"abcdefghijklmn\xC3\xA9z", "abcdefghijklmn"},  // e-acute would span bytes 15 and 16
      {"abcdefghijklm\xC3\xA9z", "abcdefghijklm\xC3\xA9"},
  };
  for (const auto& row : rows) {
    std::string comm;
    CreateNamedThread(row.name, kThreadPriorityNormal, {}, {}, [&] {
      comm = ReadThreadFile("comm");
    }).join();
    EXPECT_EQ(comm, row.shown + "\n") << row.name;
  }
}

// The nice value is field 19 of the stat line; fields after the parenthesised command.
int NiceOfCurrentThread() {
  const std::string stat = ReadThreadFile("stat");
  std::istringstream fields(stat.substr(stat.rfind(')') + 2));
  std::string field;
  for (int i = 3; i <= 19; ++i) fields >> field;
  return std::stoi(field);
}

TEST(NamedThread, LowerPrioritiesRaiseTheNiceValue) {
  const int inherited = NiceOfCurrentThread();
  int lowest = 0;
  int idle = 0;
  CreateNamedThread("lowest", kThreadPriorityLowest, {}, {}, [&] {
    lowest = NiceOfCurrentThread();
  }).join();
  CreateNamedThread("idle", kThreadPriorityIdle, {}, {}, [&] {
    idle = NiceOfCurrentThread();
  }).join();
  EXPECT_EQ(lowest, std::min(inherited + 10, 19));
  EXPECT_EQ(idle, std::min(inherited + 19, 19));
}

#endif

}  // namespace
}  // namespace kelcore::threads
