// Runs the tests, always in the same environment.
#include "support.h"

int main(int count, char** words) {
  fix_environment();
  ::testing::InitGoogleTest(&count, words);
  return RUN_ALL_TESTS();
}
