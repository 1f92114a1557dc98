// What a call fails with, for tests that assert the exact check text.
#ifndef ZELTA_TESTS_CORE_FAILURE_H
#define ZELTA_TESTS_CORE_FAILURE_H

#include <string>

#include "klv.h"

namespace zelta_test {

// The what() of the util::assertion_failure that the call raises, or
// "no failure".
template <typename Call>
std::string failureOf(Call call) {
  try {
    call();
  } catch (const util::assertion_failure& failure) {
    return failure.what();
  }
  return "no failure";
}

}  // namespace zelta_test

#endif
