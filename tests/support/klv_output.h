// Helpers for tests of the writing side of the KLV layer: the octets that a
// writer put out, and the files to copy.
#ifndef ZELTA_TESTS_SUPPORT_KLV_OUTPUT_H
#define ZELTA_TESTS_SUPPORT_KLV_OUTPUT_H

#include <sstream>
#include <string>
#include <vector>

#include "klv.h"

namespace zelta_test::klv {

// The octets written to the stream so far.
ByteVector outputOf(const std::ostringstream& stream);

// Every file of tests/data, by full path, sorted by name.
std::vector<std::string> dataFiles();

// A position that the test sets by hand.
class SettableLocator : public Locator {
public:
  const std::streampos& getPosition() override { return position_; }
  void setPosition(std::streamoff position) { position_ = position; }

private:
  std::streampos position_ = 0;
};

}  // namespace zelta_test::klv

#endif
