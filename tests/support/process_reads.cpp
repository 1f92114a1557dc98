#include "support/process_reads.h"

#include <fstream>
#include <string>

namespace zelta_test {

namespace {

bool processReads(ProcessReads& reads) {
  std::ifstream io("/proc/self/io");
  std::string name;
  std::uint64_t value = 0;
  bool octets = false;
  bool calls = false;
  while (io >> name >> value) {
    if (name == "rchar:") octets = (reads.octets = value, true);
    if (name == "syscr:") calls = (reads.calls = value, true);
  }
  return octets && calls;
}

}  // namespace

bool readsOf(const std::function<void()>& call, ProcessReads& reads) {
  ProcessReads before;
  if (!processReads(before)) return false;
  call();
  if (!processReads(reads)) return false;
  reads.octets -= before.octets;
  reads.calls -= before.calls;
  return true;
}

}  // namespace zelta_test
