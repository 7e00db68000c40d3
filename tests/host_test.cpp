// The services of the host layer.
#include <gtest/gtest.h>

#include "host/ut_str.h"
#include "support.h"

TEST(Strings, GetToken) {
  char line[] = "RuleName = r1 ;";
  char token[sizeof line];
  EXPECT_EQ(UT_STR::GetToken(line, token, " =;"), ' ');
  EXPECT_STREQ(token, "RuleName");
  EXPECT_STREQ(line, "= r1 ;");
  EXPECT_EQ(UT_STR::GetToken(line, token, " =;"), '=');
  EXPECT_STREQ(token, "");
}
