#include <gtest/gtest.h>

#include <exception>
#include <string>

#include "failure.h"
#include "klv.h"

using zelta_test::failureOf;

TEST(Check, HoldingConditionDoesNothing) {
  EXPECT_EQ(failureOf([] { check(true, "handler is present"); }), "no failure");
  EXPECT_EQ(failureOf([] { check(true, std::string("handler is present")); }), "no failure");
}

TEST(Check, FailingConditionThrowsAssertionFailureWithText) {
  EXPECT_EQ(failureOf([] { check(false, "handler is present"); }), "assertion failure: handler is present");
  EXPECT_EQ(failureOf([] { check(false, std::string("valid index")); }), "assertion failure: valid index");
}

TEST(Check, AssertionFailureIsAStandardException) {
  try {
    check(false, "successful get()");
    FAIL() << "no exception";
  } catch (const std::exception& e) {
    EXPECT_STREQ(e.what(), "assertion failure: successful get()");
  }
}

TEST(Check, AssertionFailureKeepsItsText) {
  util::assertion_failure failure("valid value");
  util::assertion_failure copy = failure;
  EXPECT_STREQ(copy.what(), "assertion failure: valid value");
}
