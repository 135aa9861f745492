// Borrowed single-threaded executors: two returned ones are kept paused, a third is
// terminated, and a borrowed spare works again.
#include <kelcore/threads/Executors.h>

#include <gtest/gtest.h>

#include <vector>

namespace kelcore::threads {
namespace {

TEST(TemporaryExecutors, KeepsTwoPausedSparesAndTerminatesTheRest) {
  // Borrowing three empties the spare list, whatever earlier tests left in it.
  std::vector<AsyncThreadedExecutorPtr> borrowed;
  for (int i = 0; i < 3; ++i) borrowed.push_back(BorrowTemporarySingleThreadedExecutor());
  for (const AsyncThreadedExecutorPtr& executor : borrowed) {
    ASSERT_TRUE(executor);
    EXPECT_EQ(executor->GetThreadCount(), 1);
    EXPECT_FALSE(executor->IsTerminated());
  }
  for (const AsyncThreadedExecutorPtr& executor : borrowed) {
    ReturnTemporarySingleThreadedExecutor(executor);
  }
  ReturnTemporarySingleThreadedExecutor(borrowed[0]);  // already a spare: ignored
  EXPECT_FALSE(borrowed[0]->IsTerminated());
  EXPECT_FALSE(borrowed[1]->IsTerminated());
  EXPECT_TRUE(borrowed[2]->IsTerminated());

  const AsyncThreadedExecutorPtr again = BorrowTemporarySingleThreadedExecutor();
  EXPECT_EQ(again, borrowed[1]);  // the last spare, resumed
  bool ran = false;
  again->CallAsynchronously([&ran] { ran = true; }, 0);
  again->Flush();
  EXPECT_TRUE(ran);
  ReturnTemporarySingleThreadedExecutor(again);
}

}  // namespace
}  // namespace kelcore::threads
