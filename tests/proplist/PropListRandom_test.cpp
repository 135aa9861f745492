#include "PropListTestSupport.h"
#include "RandomPropList.h"

#include <gtest/gtest.h>

namespace kelcore::proplist {
namespace {

// Random trees of every type: every kind of copy equals its source and writes the same
// fragment; a mutated copy differs, and its source stays as it was.
TEST(PropListRandom, CopiesEqualSourceUntilMutated) {
  for (const bool xmlSafe : {false, true}) {
    for (std::uint64_t seed = 1; seed <= 300; ++seed) {
      testing::RandomPropListGenerator random(seed, {.xmlSafe = xmlSafe});
      const PropList original = random.Make();
      PropList constructed(original);
      PropList assigned = random.Make();
      assigned = original;
      ASSERT_EQ(constructed, original) << "seed " << seed;
      ASSERT_EQ(assigned, original) << "seed " << seed;
      UTF8String a, b;
      original.OutputAsXMLFragment(a);
      constructed.OutputAsXMLFragment(b);
      ASSERT_EQ(a, b) << "seed " << seed;

      random.Mutate(constructed);
      ASSERT_NE(constructed, original) << "seed " << seed;
      ASSERT_EQ(assigned, original) << "seed " << seed;
      PropList again(constructed);
      random.Mutate(again);
      ASSERT_NE(again, constructed) << "seed " << seed;
    }
  }
}

}  // namespace
}  // namespace kelcore::proplist
