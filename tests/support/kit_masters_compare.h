// Two masters compared operation by operation, every channel's values
// among them.
#ifndef ZELTA_TESTS_SUPPORT_KIT_MASTERS_COMPARE_H
#define ZELTA_TESTS_SUPPORT_KIT_MASTERS_COMPARE_H

#include <string>
#include <vector>

#include "kit.h"

namespace zelta_test {

// "operation: expected / actual" for each operation that differs.
std::vector<std::string> masterDifferences(const ZeltaMasterMetadata& expected, const ZeltaMasterMetadata& actual);

}  // namespace zelta_test

#endif
