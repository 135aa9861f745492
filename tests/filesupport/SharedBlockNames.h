// Names for shared memory blocks that no other test, run or process uses: the test's name
// and a random Guid (a process id could repeat the name a crashed earlier run left behind).
#pragma once

#include <kelcore/utility/Guid.h>

#include <gtest/gtest.h>

#include <string>

inline std::string UniqueBlockName() {
  const ::testing::TestInfo* test = ::testing::UnitTest::GetInstance()->current_test_info();
  const kelcore::UTF8String id = kelcore::utility::Guid::CreateUnique().AsUTF8String();
  return std::string("kelcore-") + (test != nullptr ? test->name() : "test") + "-" +
         std::string(id.begin(), id.end());
}
