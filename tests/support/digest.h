// Digests that tests compare with the checksums that other tools printed.
#ifndef ZELTA_TESTS_SUPPORT_DIGEST_H
#define ZELTA_TESTS_SUPPORT_DIGEST_H

#include <string>

#include "klv.h"

namespace zelta_test {

// The MD5 of the octets in 32 lower-case hexadecimal digits.
std::string md5Hex(const ByteVector& bytes);

}  // namespace zelta_test

#endif
