// What this process has read from files, by the kernel's count.
#ifndef ZELTA_TESTS_SUPPORT_PROCESS_READS_H
#define ZELTA_TESTS_SUPPORT_PROCESS_READS_H

#include <cstdint>
#include <functional>

namespace zelta_test {

struct ProcessReads {
  std::uint64_t octets = 0;  // octets that read calls returned
  std::uint64_t calls = 0;   // read calls
};

// What the call read; false where the kernel does not count (no
// /proc/self/io).
bool readsOf(const std::function<void()>& call, ProcessReads& reads);

}  // namespace zelta_test

#endif
