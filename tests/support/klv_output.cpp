#include "support/klv_output.h"

#include <algorithm>
#include <filesystem>

#include "support/recording.h"

namespace zelta_test::klv {

ByteVector outputOf(const std::ostringstream& stream) {
  const std::string text = stream.str();
  return ByteVector(text.begin(), text.end());
}

std::vector<std::string> dataFiles() {
  std::vector<std::string> files;
  for (const auto& entry : std::filesystem::directory_iterator(dataPath("")))
    if (entry.is_regular_file()) files.push_back(entry.path().string());
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace zelta_test::klv
